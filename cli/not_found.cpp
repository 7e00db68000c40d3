#include "cli/not_found.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <system_error>

#include "cli/console.h"
#include "cli/nearest.h"
#include "file/baslafile.h"

namespace {

// Nobody waits long for what was probably meant: so many names, and so many files, are looked at.
constexpr int MOST_NAMES = 10;
constexpr int MOST_DIRECTORIES = 100;
constexpr int MOST_FILES = 10'000;

/// Whether the library looks for names without any rule.
bool is_disabled() {
  return std::getenv("LA_DISABLE") != nullptr;
}

}  // namespace

void not_found::tell(const std::string& name) {
  if (told_++ == 0) {
    extensions_ = {"kbo", "kbc"};
    for (int i = 0; rules_ != nullptr && i < rules_->rules.count; ++i) {
      const char* ext = rules_->rules.elements[i]->netlist_file->get_ext();
      if (ext != nullptr) extensions_.insert(ext);
    }
  }
  const std::string what = is_disabled() ? "" : what_is_there(name);
  complain("not found: " + name + what);
}

/// The file of this name that is of no use, or names that look alike.
std::string not_found::what_is_there(const std::string& name) const {
  const LA_FULLFILE file(name.c_str());
  const Port::FileStatus status = Port::File::status(file.get_fullfile());
  if (status.is_left_by_failed_run()) return "; the file is there, but a failed run has left it";
  if (status.exists) return "; the file is there, but no rule makes a netlist of it";
  if (told_ > MOST_NAMES) return "; see --explain";
  const std::map<std::string, std::string> near = names_near(file);
  std::set<std::string> names;
  for (const auto& [seen, given] : near) names.insert(seen);
  std::vector<std::string> meant = nearest_few(file.get_name(), names);
  const std::string head = name.substr(0, name.find_last_of("/\\") + 1);
  for (std::string& word : meant) word = std::string(head).append(near.at(word));
  return meant.empty() ? "; see --explain" : did_you_mean(meant);
}

/// The names of the files that rules read where that file is looked for, and what leads to them:
/// the name, but the whole of it where the extension is spelled in another way.
std::map<std::string, std::string> not_found::names_near(const LA_FULLFILE& file) const {
  namespace fs = std::filesystem;
  std::vector<std::string> places = {file.get_fullhead()};
  const std::string head = file.get_head() != nullptr ? file.get_head() : "";
  for (const std::string& dir : search_dirs_) places.push_back(dir + head);
  places.resize(std::min<std::size_t>(places.size(), MOST_DIRECTORIES));

  std::map<std::string, std::string> names;
  int files = 0;
  std::error_code failure;
  for (const std::string& place : places) {
    fs::directory_iterator at(place, failure);
    for (; !failure && at != fs::directory_iterator() && files < MOST_FILES; ++files) {
      const std::string tail = at->path().filename().string();
      const LA_FILE seen(tail.c_str());
      const std::string name = seen.get_name() != nullptr ? seen.get_name() : "";
      const std::string ext = seen.get_ext() != nullptr ? seen.get_ext() : "";
      const auto known = extensions_.find(ext);
      const bool is_read = known != extensions_.end() && !at->is_directory(failure);
      if (is_read && *known != ext) names.emplace(name, tail);
      if (is_read && *known == ext && name != file.get_name()) names[name] = name;
      at.increment(failure);
    }
  }
  return names;
}
