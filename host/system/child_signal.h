// The signal that tells a process of its children.
#ifndef KESTREL_HOST_SYSTEM_CHILD_SIGNAL_H
#define KESTREL_HOST_SYSTEM_CHILD_SIGNAL_H

#include <signal.h>

/// While it lives, this process can wait for a child and learn its exit code: SIGCHLD is not
/// ignored, and no handler of the host collects whichever child there is. At its end the host has
/// what it would have had without it. A default action is not touched at all, as setting it would
/// drop a pending signal.
class la_child_signal {
 public:
  la_child_signal();
  la_child_signal(const la_child_signal&) = delete;
  la_child_signal& operator=(const la_child_signal&) = delete;
  ~la_child_signal();

 private:
  struct sigaction before_ = {};
  bool is_default_;
};

#endif
