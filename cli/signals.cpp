#include "cli/signals.h"

#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include "cli/console.h"
#include "host/port_interrupt.h"

namespace {

void stop(int /*signal*/) {
  Port_Interrupt::PassOn(SIGTSTP);
  ::raise(SIGSTOP);
  // From here on the process has been continued.
  Port_Interrupt::PassOn(SIGCONT);
}

/// Interrupts, without SA_RESTART, what waits for somebody who does not read, also what was about
/// to begin to.
void tick(int /*signal*/) {
  console::hurry();
  ::alarm(1);
}

void request(int signal) {
  const bool ticks = Port_Interrupt::Requested() != 0;
  Port_Interrupt::Request(signal);
  if (ticks) return;
  struct sigaction action = {};
  action.sa_handler = tick;
  ::sigaction(SIGALRM, &action, nullptr);
  ::alarm(1);
}

struct reaction {
  int signal;
  void (*handler)(int);
};
const std::array REACTIONS = {
    reaction{SIGINT, request},
    reaction{SIGTERM, request},
    reaction{SIGHUP, request},
    reaction{SIGQUIT, request},
    reaction{SIGTSTP, stop},
    // Who reads the messages may leave. The netlister that runs still ends as it should.
    reaction{SIGPIPE, SIG_IGN},
};

}  // namespace

signal_handling::signal_handling() {
  static_assert(std::tuple_size_v<decltype(REACTIONS)> == COUNT);
  Port_Interrupt::SetOwnGroups(true);
  // Whatever a netlister leaves behind comes to this process, which need not wait for another one
  // to reap it.
  ::prctl(PR_SET_CHILD_SUBREAPER, 1);
  // A signal that was blocked when this program was started would not tick.
  sigset_t ticks;
  ::sigemptyset(&ticks);
  ::sigaddset(&ticks, SIGALRM);
  ::sigprocmask(SIG_UNBLOCK, &ticks, &mask_before_);
  for (std::size_t i = 0; i < COUNT; ++i) {
    const auto& [signal, handler] = REACTIONS[i];
    struct sigaction action = {};
    action.sa_handler = handler;
    action.sa_flags = SA_RESTART;
    ::sigaction(signal, nullptr, &before_[i]);
    if (before_[i].sa_handler != SIG_IGN) ::sigaction(signal, &action, nullptr);
  }
}

signal_handling::~signal_handling() {
  if (Port_Interrupt::Requested() != 0) ::alarm(0);
  ::sigprocmask(SIG_SETMASK, &mask_before_, nullptr);
  for (std::size_t i = 0; i < COUNT; ++i) {
    ::sigaction(REACTIONS[i].signal, &before_[i], nullptr);
  }
}

void reap_orphans() {
  while (::waitpid(-1, nullptr, WNOHANG) > 0) {
  }
}
