#include "cli/names.h"

#include <fcntl.h>
#include <unistd.h>

#include "host/port_file.h"

std::string read_names(const std::string& file, std::vector<std::string>& names) {
  const int descriptor =
      file == "-" ? ::dup(STDIN_FILENO) : ::open(file.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) return "--names-from: could not read " + file;
  Port::Stream in(descriptor);
  char line[4096];
  for (int number = 1; !in.geteof(); ++number) {
    const auto length = static_cast<std::size_t>(in.readline(line, sizeof line));
    if (length >= sizeof line) return "--names-from: " + file + " holds a line that is too long";
    std::string name = line;
    if (name.size() != length) {
      return "--names-from: " + file + ", line " + std::to_string(number) + " holds a zero byte";
    }
    if (name.ends_with('\r')) name.pop_back();
    if (!name.empty()) names.push_back(std::move(name));
  }
  return in.failed() ? "--names-from: could not read " + file : "";
}
