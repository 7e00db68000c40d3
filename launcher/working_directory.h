// The directory of the process while the netlisters of a chain run.
#ifndef KESTREL_LAUNCHER_WORKING_DIRECTORY_H
#define KESTREL_LAUNCHER_WORKING_DIRECTORY_H

#include <optional>

#include "file/baslafile.h"
#include "host/port_file.h"
#include "launcher/message.h"

class LA_RULE;

/// Goes from home to the directories that rules ask for, and back home at its end.
class la_working_directory {
 public:
  /// home: the current directory; it must outlive this object.
  explicit la_working_directory(const LA_DIR& home) : home_(home) {}
  la_working_directory(const la_working_directory&) = delete;
  la_working_directory& operator=(const la_working_directory&) = delete;
  ~la_working_directory() { leave(); }

  /// Goes where the rule wants its netlister to run. If it cannot go there, the process stays
  /// where it is. In detail, tells where, and what the netlister will inherit.
  void enter(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
             const la_report& report);
  /// Goes home.
  void leave();
  /// Whether the process has been home all the time.
  bool never_left() const { return !left_; }

 private:
  const LA_DIR& home_;
  std::optional<Port::Place> left_;  ///< home, by whatever name it goes now
};

#endif
