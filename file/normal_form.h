// The normal form of a full path: without "./" and "../".
#ifndef KESTREL_FILE_NORMAL_FORM_H
#define KESTREL_FILE_NORMAL_FORM_H

#include "file/path_text.h"

/// Whether a path, or a part of one that is made of whole names, is in its normal form.
bool la_is_normal(std::string_view path);

/// Resolves "./" and "../", wherever they stand in path. A path whose "../" would climb above the
/// first directory stays as it is.
void la_normalise(la_path_text& path);

#endif
