// What the host asked for when it made the launcher, as building a chain needs it.
#ifndef KESTREL_LAUNCHER_BUILD_SETTINGS_H
#define KESTREL_LAUNCHER_BUILD_SETTINGS_H

#include <span>

#include "file/baslafile.h"
#include "host/ut_str.h"

/// Texts and directory are the launcher's. A text may be null.
struct la_build_settings {
  const LA_DIR& output_dir;
  bool force;
  bool ignore_timestamps;
  const char* part_name;
  std::span<const la_text> libraries;
  /// The switches of netlisters, as the keywords of their names expand.
  const char* ignore_locs;
  const char* add_pads;
  const char* quiet;
  const char* aul;
};

#endif
