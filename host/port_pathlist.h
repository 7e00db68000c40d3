// The installation roots: the directories that hold data/.
#ifndef KESTREL_HOST_PORT_PATHLIST_H
#define KESTREL_HOST_PORT_PATHLIST_H

#include <cstddef>
#include <utility>
#include <vector>

#include "host/port_string.h"

namespace Port {

/// A place in a PathList; good as long as the list is.
class PathListIterator {
 public:
  explicit PathListIterator(const StringBase<char>* place) : place_(place) {}

  bool operator!=(const PathListIterator& other) const { return place_ != other.place_; }
  /// The directory at this place, without a trailing separator.
  const StringBase<char>& operator*() const { return *place_; }
  PathListIterator& operator++() {
    ++place_;
    return *this;
  }

 private:
  const StringBase<char>* place_;
};

/// Directories, in the order in which they are searched.
class PathList {
 public:
  PathList() = default;
  explicit PathList(std::vector<StringBase<char>> paths) : paths_(std::move(paths)) {}

  PathListIterator begin() const { return PathListIterator(paths_.data()); }
  PathListIterator end() const { return PathListIterator(paths_.data() + paths_.size()); }

 private:
  std::vector<StringBase<char>> paths_;
};

/// The list of installation roots.
class CvnenvPath {
 public:
  /// The installation roots of the process: the entries of the environment variable MYCORVANE,
  /// then those of CORVANE, each a list separated by ":"; when neither is set,
  /// share/kestrel-launcher beside the bin directory of the running program or beside the lib
  /// directory of the shared library if that is there, else the directory that the build
  /// configured. The list is good until one of the two variables has
  /// changed and GetInstance is called again.
  static const PathList& GetInstance();
};

}  // namespace Port

#endif
