#include "host/cvnform.h"

#include <cstring>

#include "host/base/utf8.h"
#include "host/ut_str.h"

// The analyzer does not see that the callers have started the list.
// NOLINTBEGIN(clang-analyzer-valist.Uninitialized)
std::string format_text(const char* format, va_list arguments) {
  std::string text;
  text.reserve(120);  // Most texts are shorter.
  for (const char* f = format; *f != '\0'; ++f) {
    const std::size_t plain = std::strcspn(f, "%");
    text.append(f, plain);
    f += plain;
    if (*f == '\0') break;
    switch (*++f) {
      case 's':
        if (const char* value = va_arg(arguments, const char*)) text += value;
        break;
      case 'z':
        if (const wchar_t* value = va_arg(arguments, const wchar_t*)) text += to_utf8(value);
        break;
      case 'd':
        text += std::to_string(va_arg(arguments, int));
        break;
      case 'c':
        text += static_cast<char>(va_arg(arguments, int));
        break;
      case '\0':
        return text + '%';
      default:
        text += *f;
    }
  }
  return text;
}
// NOLINTEND(clang-analyzer-valist.Uninitialized)

char* cvnform(const char* format, ...) {
  static char text[LA_MAX_PATH];
  va_list arguments;
  va_start(arguments, format);
  const std::string formatted = format_text(format, arguments);
  va_end(arguments);
  return UT_STR::Copy(text, formatted.c_str());
}
