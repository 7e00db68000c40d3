// How a program of the bench measures a piece of work and tells the bench what it cost.
#ifndef KESTREL_BENCH_MEASURE_H
#define KESTREL_BENCH_MEASURE_H

#include <sys/resource.h>
#include <time.h>

#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <vector>

/// Nanoseconds of processor time of this process, or of its children that it has waited for.
inline double processor_time(int who) {
  rusage used = {};
  ::getrusage(who, &used);
  const auto seconds = static_cast<double>(used.ru_utime.tv_sec + used.ru_stime.tv_sec);
  return seconds * 1e9 + static_cast<double>(used.ru_utime.tv_usec + used.ru_stime.tv_usec) * 1e3;
}

inline double wall_time() {
  timespec now = {};
  ::clock_gettime(CLOCK_MONOTONIC, &now);
  return static_cast<double>(now.tv_sec) * 1e9 + static_cast<double>(now.tv_nsec);
}

/// Does the work so many times. The profiler counts in this function alone, by its name.
template <class Work>
[[gnu::noinline]] void bench_measured(int times, Work& work) {
  for (int i = 0; i < times; ++i) work();
}

/// Does the work, and prints what it took each time in nanoseconds.
template <class Work>
void measure(int times, Work work) {
  const double self = processor_time(RUSAGE_SELF);
  const double children = processor_time(RUSAGE_CHILDREN);
  const double wall = wall_time();
  bench_measured(times, work);
  std::printf("{\"wall\": %.1f, \"cpu\": %.1f, \"children\": %.1f}\n", (wall_time() - wall) / times,
              (processor_time(RUSAGE_SELF) - self) / times,
              (processor_time(RUSAGE_CHILDREN) - children) / times);
}

/// Makes the process as big as a host of so many megabytes, all of them in use.
inline void grow(int megabytes) {
  static std::vector<char> memory;
  memory.assign(static_cast<std::size_t>(megabytes) << 20, 1);
}

/// Ends the program when something that the bench takes for granted does not hold.
inline void require(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "The bench does not measure what it should: %s\n", what);
  std::exit(1);
}

#endif
