// What the fuzz targets share. Each target is one source file, which defines examine().
#ifndef KESTREL_TESTS_FUZZ_FUZZ_H
#define KESTREL_TESTS_FUZZ_FUZZ_H

#include "support.h"

/// Gives the library an input, and expects what must hold for every one.
void examine(const std::string& input, Tree& tree);

/// text with its letters in lower case.
std::string lower(std::string text);
/// Writes text to path, a file of user or of system rules, and loads it. Returns all that is said
/// then, and the rules. Expects that the other kind of line end makes no difference.
std::string rules_from(Tree& tree, const std::string& path, const std::string& text);

#endif
