// The formatter for texts.
#ifndef KESTREL_HOST_CVNFORM_H
#define KESTREL_HOST_CVNFORM_H

#include <cstdarg>
#include <string>

/// Formats in the manner of printf: "%s" (a string; null prints as nothing), "%d" (an int), "%c"
/// (a character), "%z" (a wchar_t string, as UTF-8), "%%".
std::string format_text(const char* format, va_list arguments);

/// Formats likewise, into a buffer of its own that the next call overwrites. Returns the text; null
/// when it is longer than the buffer of LA_MAX_PATH characters holds. Not for two threads.
char* cvnform(const char* format, ...);

#endif
