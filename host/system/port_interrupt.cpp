// Port_Interrupt: passes on signals to the child that runs.
#include "host/port_interrupt.h"

#include <signal.h>
#include <time.h>

#include <atomic>
#include <cerrno>
#include <limits>

#include "host/system/process_group.h"
#include "host/system/running_child.h"

namespace {

// A signal handler works on these, at any moment.
std::atomic<int> requests = 0;
std::atomic<int> first_signal = 0;
constexpr long long NEVER = std::numeric_limits<long long>::max();
std::atomic<long long> first_moment = NEVER;
std::atomic<int> passed_on = 0;  ///< how many of the requests the running child has got
std::atomic<pid_t> running = 0;  ///< a process, minus a process group, or 0
std::atomic<bool> groups = false;
static_assert(std::atomic<long long>::is_always_lock_free);
static_assert(std::atomic<int>::is_always_lock_free && std::atomic<bool>::is_always_lock_free);

/// timeout(1) signals a process, then its group: the same signal so soon is the same request.
constexpr long long SAME_MOMENT = 100'000'000;

/// Nanoseconds of a clock that is never set.
long long now() {
  timespec time = {};
  ::clock_gettime(CLOCK_MONOTONIC, &time);
  return time.tv_sec * 1'000'000'000LL + time.tv_nsec;
}

/// Sends the child what it has not got yet. A handler calls this in the midst of anything, also of
/// itself: whoever raises passed_on does the sending, so that no request is sent twice.
void pass_on_requests() {
  const int number = requests;
  const pid_t target = running;
  if (target == 0 || passed_on.exchange(number) >= number) return;
  ::kill(target, number == 1 ? first_signal.load() : SIGKILL);
  // A stopped process does not notice before it goes on.
  ::kill(target, SIGCONT);
}

/// Waits until nothing in a process group lives, for a second at the most.
bool is_gone(pid_t group) {
  constexpr timespec MOMENT = {0, 10'000'000};
  for (int i = 0; i < 100; ++i) {
    if (!la_group_lives(group)) return true;
    ::nanosleep(&MOMENT, nullptr);
  }
  return false;
}

}  // namespace

void Port_Interrupt::Request(int signal) {
  const int error = errno;
  int earlier = 0;
  if (first_signal.compare_exchange_strong(earlier, signal)) first_moment = now();
  const bool is_same = earlier == signal && now() - first_moment < SAME_MOMENT;
  if (!is_same) {
    ++requests;
    pass_on_requests();
  }
  errno = error;
}

int Port_Interrupt::Requested() {
  return first_signal;
}

void Port_Interrupt::Clear() {
  requests = 0;
  first_signal = 0;
  first_moment = NEVER;
}

void Port_Interrupt::SetOwnGroups(bool own) {
  groups = own;
}

void Port_Interrupt::PassOn(int signal) {
  const int error = errno;
  const pid_t target = running;
  if (target != 0) ::kill(target, signal);
  errno = error;
}

bool la_running_child::leads_group() {
  return groups;
}

void la_running_child::started(pid_t child) {
  passed_on = 0;
  running = groups ? -child : child;
  pass_on_requests();
}

void la_running_child::ended() {
  if (!groups) running = 0;
}

void la_running_child::reaped(pid_t child) {
  if (groups && Port_Interrupt::Requested() != 0 && !is_gone(child)) {
    ::kill(-child, SIGKILL);
    is_gone(child);
  }
  running = 0;
}
