#include "host/system/program_place.h"

#include <dlfcn.h>

#include <cstdlib>
#include <memory>

namespace {

struct release {
  void operator()(char* text) const { std::free(text); }
};

std::string directory_of(const std::string& path) {
  return path.substr(0, path.rfind('/') + 1);
}

}  // namespace

std::string la_resolved(const std::string& path) {
  const std::unique_ptr<char, release> full(::realpath(path.c_str(), nullptr));
  return full ? full.get() : "";
}

std::vector<std::string> la_program_places() {
  Dl_info library = {};
  ::dladdr(reinterpret_cast<void*>(&la_program_places), &library);
  const std::string bin = directory_of(la_resolved("/proc/self/exe"));
  const std::string lib = directory_of(la_resolved(library.dli_fname ? library.dli_fname : ""));
  // Libraries may lie one level deeper, in a directory for the kind of machine.
  return {bin + "..", lib + "..", lib + "../.."};
}
