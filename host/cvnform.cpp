#include "host/cvnform.h"

#include <cstdarg>
#include <cstdio>

#include "host/ut_str.h"

char* cvnform(const char* format, ...) {
  static char text[LA_MAX_PATH];
  va_list arguments;
  va_start(arguments, format);
  const int length = std::vsnprintf(text, sizeof text, format, arguments);
  va_end(arguments);
  return length >= 0 && length < LA_MAX_PATH ? text : nullptr;
}
