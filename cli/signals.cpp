#include "cli/signals.h"

#include <sys/prctl.h>

#include "host/port_interrupt.h"

namespace {

void stop(int /*signal*/) {
  Port_Interrupt::PassOn(SIGTSTP);
  ::raise(SIGSTOP);
  // From here on the process has been continued.
  Port_Interrupt::PassOn(SIGCONT);
}

struct reaction {
  int signal;
  void (*handler)(int);
  int flags;
};
const std::array REACTIONS = {
    // These end the wait for somebody who does not read.
    reaction{SIGINT, Port_Interrupt::Request, 0},
    reaction{SIGTERM, Port_Interrupt::Request, 0},
    reaction{SIGHUP, Port_Interrupt::Request, 0},
    reaction{SIGQUIT, Port_Interrupt::Request, 0},
    reaction{SIGTSTP, stop, SA_RESTART},
    // Who reads the messages may leave. The netlister that runs still ends as it should.
    reaction{SIGPIPE, SIG_IGN, 0},
};

}  // namespace

signal_handling::signal_handling() {
  static_assert(std::tuple_size_v<decltype(REACTIONS)> == COUNT);
  Port_Interrupt::SetOwnGroups(true);
  // Whatever a netlister leaves behind comes to this process, which need not wait for another one
  // to reap it.
  ::prctl(PR_SET_CHILD_SUBREAPER, 1);
  for (std::size_t i = 0; i < COUNT; ++i) {
    const auto& [signal, handler, flags] = REACTIONS[i];
    struct sigaction action = {};
    action.sa_handler = handler;
    action.sa_flags = flags;
    ::sigaction(signal, nullptr, &before_[i]);
    if (before_[i].sa_handler != SIG_IGN) ::sigaction(signal, &action, nullptr);
  }
}

signal_handling::~signal_handling() {
  for (std::size_t i = 0; i < COUNT; ++i) {
    ::sigaction(REACTIONS[i].signal, &before_[i], nullptr);
  }
}
