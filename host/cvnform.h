// The formatter for short texts.
#ifndef KESTREL_HOST_CVNFORM_H
#define KESTREL_HOST_CVNFORM_H

/// Formats like printf, into a buffer of its own that the next call overwrites. Returns the text;
/// null when it is longer than the buffer of LA_MAX_PATH characters holds. Not for two threads.
[[gnu::format(printf, 1, 2)]] char* cvnform(const char* format, ...);

#endif
