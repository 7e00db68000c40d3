// What the command does when it gets a signal.
#ifndef KESTREL_CLI_SIGNALS_H
#define KESTREL_CLI_SIGNALS_H

#include <signal.h>

#include <array>

/// While it lives, a signal that would end this process interrupts the netlister that runs, and
/// one that stops this process stops the netlister too. Signals that are ignored stay so.
///
/// To be followed, in the end, by Port_Interrupt::Requested() and raise.
class signal_handling {
 public:
  signal_handling();
  signal_handling(const signal_handling&) = delete;
  signal_handling& operator=(const signal_handling&) = delete;
  ~signal_handling();

 private:
  static constexpr std::size_t COUNT = 6;
  std::array<struct sigaction, COUNT> before_ = {};
  sigset_t mask_before_ = {};
};

/// Reaps what netlisters have left behind and has ended since: it comes to this process while
/// signal_handling lives. Not to be called while a child is waited for.
void reap_orphans();

#endif
