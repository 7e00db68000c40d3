// The two spellings of a path: the internal form, with forward slashes only, and the external
// form, the one of the operating system.
#ifndef KESTREL_HOST_UT_PATH_H
#define KESTREL_HOST_UT_PATH_H

/// The conversion between the two.
class UT_PATH {
 public:
  /// Converts path in place from the internal to the external form and returns it. On this
  /// platform both are the same.
  static char* ExternalPath(char* path) { return path; }
};

#endif
