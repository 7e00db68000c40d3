// An open file descriptor that closes itself.
#ifndef KESTREL_HOST_SYSTEM_DESCRIPTOR_H
#define KESTREL_HOST_SYSTEM_DESCRIPTOR_H

#include <unistd.h>

#include <utility>

/// An open file descriptor, or none (-1).
class la_descriptor {
 public:
  explicit la_descriptor(int number = -1) : number_(number) {}
  la_descriptor(la_descriptor&& other) noexcept : number_(std::exchange(other.number_, -1)) {}
  la_descriptor& operator=(la_descriptor&& other) noexcept {
    std::swap(number_, other.number_);
    return *this;
  }
  ~la_descriptor() { close(); }

  void close() {
    if (number_ >= 0) ::close(std::exchange(number_, -1));
  }
  int get() const { return number_; }
  /// From now on somebody else closes it.
  void release() { number_ = -1; }

 private:
  int number_;
};

#endif
