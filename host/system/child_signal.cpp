#include "host/system/child_signal.h"

#include <sys/wait.h>
#include <unistd.h>

la_child_signal::la_child_signal() {
  ::sigaction(SIGCHLD, nullptr, &before_);
  is_default_ = before_.sa_handler == SIG_DFL && (before_.sa_flags & SA_NOCLDWAIT) == 0;
  if (is_default_) return;
  struct sigaction action = {};
  action.sa_handler = SIG_DFL;
  ::sigaction(SIGCHLD, &action, nullptr);
}

la_child_signal::~la_child_signal() {
  if (is_default_) return;
  ::sigaction(SIGCHLD, &before_, nullptr);
  const bool is_ignored = before_.sa_handler == SIG_IGN;
  if (is_ignored || (before_.sa_flags & SA_NOCLDWAIT) != 0) {
    // No child of such a host waits to be reaped.
    while (::waitpid(-1, nullptr, WNOHANG) > 0) {
    }
  }
  // Its handler, or whoever reads the signal, may have missed the end of another child.
  if (!is_ignored) ::kill(::getpid(), SIGCHLD);
}
