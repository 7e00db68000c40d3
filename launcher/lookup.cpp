#include "launcher/lookup.h"

#include <utility>

#include "host/port_string.h"
#include "launcher/message.h"

la_lookup::la_lookup(const LA_FULLFILE& given, std::span<LA_FULLROOT> searchpaths,
                     const la_home& home, LA_EXPLANATION* why)
    : given_(given),
      searchpaths_(searchpaths),
      home_(home),
      why_(why),
      root_(given.get_root()),
      beside_(given) {}

bool la_lookup::find_file(const char* ext, la_found_file& found) {
  const char* path = beside_.with_ext(ext);
  const Port::FileStatus status = look_at(path);
  if (!status.exists) return find_in_searchpaths(ext, found);
  note(LA_EXPLANATION::FOUND, path);
  found = {given_, status};
  found.file.set_ext(ext);
  return true;
}

/// Visits all search directories, so that the report on files passed over is complete.
bool la_lookup::find_in_searchpaths(const char* ext, la_found_file& found) {
  if (!std::exchange(has_searched_, true)) {
    // A head may begin with a drive, which is dropped.
    const LA_FILE relative((root_ + ".").c_str());
    const char* root = relative.get_root();
    for (LA_FULLROOT& place : searchpaths_) place.set_root(root);
  }
  bool found_any = false;
  Port::StringBase<char> first;
  Port::StringBase<char> others;
  for (LA_FULLROOT& place : searchpaths_) {
    const char* path = place.with_ext(ext);
    const Port::FileStatus status = look_at(path);
    if (!status.exists) continue;
    const Port::StringBase<char> name(path);
    if (!found_any) {
      note(LA_EXPLANATION::FOUND, path);
      found = {LA_FULLFILE(place.directory(), name_with(ext).c_str()), status};
      first = name;
      found_any = true;
    } else if (!(name == first) && others.GetIndexOfString(name, Port::StringBase<char>::EXACT) ==
                                       Port::StringBase<char>::NOT_FOUND) {
      note(LA_EXPLANATION::PASSED_OVER, path);
      others += "\t";
      others += name;
      others += "\n";
    }
  }
  if (!others.empty()) {
    la_launcher_message().issueInfo(
        "Found resolution for '%s' using the search path (-sd switches):\n\t%s\nOther matching "
        "files found later in the search path will not be used:\n%sEnsure that the correct file "
        "is used by modifying the search path order.\n",
        name_with(ext).c_str(), first.c_str(), others.c_str());
  }
  return found_any;
}

/// What is known of a file, unless a failed run has left it; path may be null. A file that is there
/// is for the caller to note, who knows what comes of it.
Port::FileStatus la_lookup::look_at(const char* path) {
  const Port::FileStatus status = home_.status(path);
  if (!status.exists) {
    note(LA_EXPLANATION::MISSING, path);
    return {};
  }
  if (!status.is_left_by_failed_run()) return status;
  note(LA_EXPLANATION::LEFT_BY_FAILURE, path);
  if (told_.insert(path).second) report_left_by_failure(path);
  return {};
}

void la_lookup::note(LA_EXPLANATION::SIGHTING sighting, const char* path) const {
  if (why_ != nullptr && path != nullptr) why_->probes.push_back({sighting, path});
}

/// The given name with this extension.
std::string la_lookup::name_with(const char* ext) const {
  return ext != nullptr ? root_ + "." + ext : root_;
}

void report_left_by_failure(const char* path) {
  la_launcher_message().issueInfo("Launcher: %s is passed over: a run that failed has left it.\n",
                                  path);
}
