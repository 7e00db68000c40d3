#include "launcher/baslauncher.h"

#include <algorithm>
#include <climits>
#include <cstring>
#include <exception>
#include <iterator>
#include <optional>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "host/pm_pic.h"
#include "host/port_env.h"
#include "host/port_init.h"
#include "host/port_interrupt.h"
#include "host/port_msgman.h"
#include "host/port_string.h"
#include "launcher/command_options.h"
#include "launcher/explanation.h"
#include "launcher/rule_index.h"
#include "rules/baslarules.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.13 $";

Port_MsgManData& message(int line = __builtin_LINE()) {
  return Port_MsgManData::createObject("Kestrel", "launcher/baslauncher.cpp", line, revision);
}

Port::FileStatus status_of(const char* path) {
  return path != nullptr ? Port::File::status(path) : Port::FileStatus();
}

/// A full name without its directory.
const char* tail_of(const char* path) {
  return std::strrchr(path, '/') + 1;
}

/// The elements of an array that is kept with its count.
template <class Element>
std::span<Element> counted(const std::unique_ptr<Element[]>& array, short count) {
  return {array.get(), static_cast<std::size_t>(count)};
}

}  // namespace

void La_Port_Process::Output(const char* text) {
  message().issueStatusText(text);
}

void La_Port_Process::Pause() {
  Port_MsgManData::flush();
}

// ---- The launcher object ----

LA_LAUNCHER::LA_LAUNCHER(const char* part_name, const char** searchpaths, short num_searchpaths,
                         const char** libraries, short num_libraries, const char* output_dir,
                         const char* user_rules_file, unsigned char force,
                         unsigned char ignore_timestamps, unsigned char ignore_locs,
                         unsigned char add_pads, unsigned char quiet, unsigned char aul)
    : detail(Port_Env::GetEnv("LAUNCHER_DETAIL") != nullptr),
      part_name(part_name),
      output_dir(new LA_DIR(output_dir)),
      num_searchpaths(0),
      num_libraries(num_libraries),
      force(force),
      ignore_timestamps(ignore_timestamps),
      ignore_locs(ignore_locs ? "-r" : nullptr),
      add_pads(add_pads ? "-a" : nullptr),
      quiet(quiet ? "-quiet" : nullptr),
      aul(aul ? "-aul" : nullptr) {
  if (searchpaths != nullptr) add_searchpaths(searchpaths, num_searchpaths);
  if (libraries != nullptr) {
    this->libraries.reset(new la_text[static_cast<std::size_t>(num_libraries)]);
    std::copy(libraries, libraries + num_libraries, this->libraries.get());
  }
  rules = std::make_unique<LA_RULE_SET>(part_name, user_rules_file);
  index = std::make_unique<la_rule_index>(rules->rules);
  ok = rules->is_valid;
}

LA_LAUNCHER::~LA_LAUNCHER() = default;

void LA_LAUNCHER::add_searchpaths(const char** new_paths, short num_new_paths) {
  const int total = num_searchpaths + num_new_paths;
  if (total > SHRT_MAX) {
    message().issueError("Launcher: There can be at most %d search directories.\n", SHRT_MAX);
    return;
  }
  std::unique_ptr<std::unique_ptr<LA_DIR>[]> paths(
      new std::unique_ptr<LA_DIR>[static_cast<std::size_t>(total)]);
  std::move(searchpaths.get(), searchpaths.get() + num_searchpaths, paths.get());
  std::transform(new_paths, new_paths + num_new_paths, paths.get() + num_searchpaths,
                 [](const char* path) { return std::make_unique<LA_DIR>(path); });
  searchpaths = std::move(paths);
  num_searchpaths = static_cast<short>(total);
}

// ---- Netlist lookup ----

short LA_LAUNCHER::find(const char* name, char* source_path, char* netlist_path,
                        unsigned char top) {
  source_path[0] = '\0';
  netlist_path[0] = '\0';
  netlist_seen = false;
  try {
    if (Port_Env::GetEnv("LA_DISABLE") != nullptr) return find_disabled(name, netlist_path);
    return find_enabled(name, source_path, netlist_path, top);
  } catch (const std::exception& failure) {
    message().issueError("Launcher: Could not resolve %s: %s\n", name, failure.what());
    ++errors;
    source_path[0] = '\0';
    netlist_path[0] = '\0';
    return LA_FAILED;
  }
}

/// Looks for the name in lower case, without rules and messages.
short LA_LAUNCHER::find_disabled(const char* name, char* netlist_path) {
  char lower_name[LA_MAX_PATH];
  if (UT_STR::Copy(lower_name, name) == nullptr) return LA_NOT_FOUND;
  UT_STR::Lower(lower_name);
  // The names are kept here: there may be more of them than the ring of results has slots.
  std::vector<la_text> names;
  std::vector<const char*> dirs;
  for (const auto& dir : counted(searchpaths, num_searchpaths)) names.emplace_back(dir->get_dir());
  dirs.assign(names.begin(), names.end());
  const char* found = Port::File::find(lower_name, dirs.data(), num_searchpaths, netlist_path);
  netlist_seen = found != nullptr;
  return netlist_seen ? LA_FOUND : LA_NOT_FOUND;
}

/// The name that find was given, and where it looks for files of this name.
struct LA_LAUNCHER::lookup {
  explicit lookup(const LA_FULLFILE& given) : given(given), root(given.get_root()), beside(given) {}

  /// The given name with another extension.
  std::string file(const char* ext) const { return ext != nullptr ? root + "." + ext : root; }

  const LA_FULLFILE& given;
  const std::string root;  ///< head and name
  LA_FULLROOT beside;      ///< where the name says
};

short LA_LAUNCHER::find_enabled(const char* name, char* source_path, char* netlist_path,
                                unsigned char top) {
  find_home();
  LA_FULLFILE given(home, name);
  bool named_kbc = false;
  if (given.match_ext("kbo")) {
    given.set_ext(nullptr);
  } else {
    named_kbc = given.match_ext("kbc");
  }
  if (!is_usable(given, name)) {
    ++errors;
    return LA_FAILED;
  }
  if (is_interrupted(given)) return LA_FAILED;

  lookup where(given);
  in_searchpaths.clear();
  found_file source;
  DARRAY_LA_RULE_CONST_PTR chain(3);
  find_named(where);
  std::vector<unsigned char> visited(static_cast<std::size_t>(rules->rules.count));
  short result = plan_chain(where, "kbo", visited.data(), source, chain);
  if (result == LA_FOUND) {
    result = build_chain(source, chain, top, netlist_path);
  } else if (result == LA_NOT_FOUND) {
    result = find_native(where, named_kbc, source, netlist_path);
  }
  if (result == LA_FOUND) UT_STR::Copy(source_path, source.file.get_fullfile());
  return result;
}

/// Takes the current directory for home. Files below it are asked for by relative names if its name
/// leads to it: a netlister may have seen to it that it does not any more.
void LA_LAUNCHER::find_home() {
  home.set_dir(nullptr);
  const char* name = home.get_dir();
  if (name == nullptr) {
    home_name.clear();
  } else if (home_name != name || home_runs != runs) {
    home_name = Port::File::same(name, ".") ? name : "";
  }
  home_runs = runs;
}

/// Whether a netlist can be looked for by this name; if not, says why.
bool LA_LAUNCHER::is_usable(const LA_FULLFILE& given, const char* name) {
  const bool fits = UT_STR::Len(name) < LA_MAX_PATH;
  if (fits && given.get_name() == nullptr) {
    message().issueError("No base name given in netlist specification \"%s\".\n", name);
    return false;
  }
  if (fits && given.get_fullfile() != nullptr) return true;
  if (fits && home.get_dir() == nullptr) {
    message().issueError(
        "Launcher: The current directory cannot be used for netlist \"%s\": it is gone, too long, "
        "or has a backslash in its name.\n",
        name);
  } else {
    message().issueError(
        "Launcher: The full name of netlist \"%s\" is longer than %d characters.\n", name,
        LA_MAX_PATH - 1);
  }
  return false;
}

/// Whether the host has asked for an end; if so, says what is not done.
bool LA_LAUNCHER::is_interrupted(const LA_FULLFILE& file) {
  if (Port_Interrupt::Requested() == 0) return false;
  message().issueError("Launcher: The work on %s was interrupted.\n", file.get_tail());
  ++errors;
  return true;
}

/// Looks for the very file that the user named with an extension.
void LA_LAUNCHER::find_named(lookup& where) {
  named_found = 0;
  named_file.file.set_file();
  const char* ext = where.given.get_ext();
  if (ext == nullptr) return;
  named_found = find_file(where, ext, named_file);
  if (named_found) return;
  message().issueWarning(
      "Launcher: Could not find file %s with extension %s in the search path. Ignoring "
      "extension.\n",
      where.given.get_fullroot(), ext);
  ++warnings;
}

/// Looks for a file that needs no rule: .kbo, then .kbc; only .kbc when the user asked for that.
short LA_LAUNCHER::find_native(lookup& where, bool named_kbc, found_file& source,
                               char* netlist_path) {
  const char* ext = named_kbc ? where.given.get_ext() : "kbo";
  const bool found_first = find_file(where, ext, source);
  if (!found_first && !find_file(where, "kbc", source)) return LA_NOT_FOUND;
  if (found_first && !named_kbc) {
    message().issueStatus("Launcher: NOT compiling %s because its source was not found\n",
                          source.file.get_tail());
  }
  UT_STR::Copy(netlist_path, source.file.get_fullfile());
  netlist_seen = true;
  return LA_FOUND;
}

// ---- Search-path resolution ----

/// The name of a file while the current directory is home. Below it, that is a relative one: it
/// spares the file system the way down to it.
const char* LA_LAUNCHER::at_home(const char* path) const {
  const bool is_below = path != nullptr && std::string_view(path).starts_with(home_name) &&
                        path[home_name.size()] != '/';
  return is_below ? path + home_name.size() : path;
}

Port::FileStatus LA_LAUNCHER::status_at_home(const char* path) const {
  return status_of(at_home(path));
}

/// Looks where the name says, then in the search directories.
bool LA_LAUNCHER::find_file(lookup& where, const char* ext, found_file& found) {
  const char* path = where.beside.with_ext(ext);
  const Port::FileStatus status = status_at_home(path);
  note(path, status.exists ? LA_EXPLANATION::FOUND : LA_EXPLANATION::MISSING);
  if (!status.exists) return find_in_searchpaths(where, ext, found);
  found = {where.given, status};
  found.file.set_ext(ext);
  return true;
}

/// Adds a place where a file was looked for to the explanation.
void LA_LAUNCHER::note(const char* path, LA_EXPLANATION::SIGHTING sighting) const {
  if (explanation != nullptr && path != nullptr) explanation->probes.push_back({sighting, path});
}

/// Looks in the search directories. All of them are visited, so that the report on files passed
/// over is complete. found is written only when there is one.
unsigned char LA_LAUNCHER::find_in_searchpaths(lookup& where, const char* ext, found_file& found) {
  const auto dirs = counted(searchpaths, num_searchpaths);
  if (in_searchpaths.size() < dirs.size()) {
    // A head may begin with a drive, which is dropped.
    const LA_FILE relative((where.root + ".").c_str());
    const char* root = relative.get_root();
    in_searchpaths.reserve(dirs.size());
    for (const auto& dir : dirs) in_searchpaths.emplace_back(*dir, root);
  }
  bool found_any = false;
  Port::StringBase<char> first;
  Port::StringBase<char> others;
  for (std::size_t i = 0; i < dirs.size(); ++i) {
    const char* path = in_searchpaths[i].with_ext(ext);
    const Port::FileStatus status = status_at_home(path);
    if (!status.exists) {
      note(path, LA_EXPLANATION::MISSING);
      continue;
    }
    const Port::StringBase<char> name(path);
    if (!found_any) {
      note(path, LA_EXPLANATION::FOUND);
      found = {LA_FULLFILE(*dirs[i], where.file(ext).c_str()), status};
      first = name;
      found_any = true;
    } else if (!(name == first) && others.GetIndexOfString(name, Port::StringBase<char>::EXACT) ==
                                       Port::StringBase<char>::NOT_FOUND) {
      note(path, LA_EXPLANATION::PASSED_OVER);
      others += "\t";
      others += name;
      others += "\n";
    }
  }
  if (!others.empty()) {
    message().issueInfo(
        "Found resolution for '%s' using the search path (-sd switches):\n\t%s\nOther matching "
        "files found later in the search path will not be used:\n%sEnsure that the correct file "
        "is used by modifying the search path order.\n",
        where.file(ext).c_str(), first.c_str(), others.c_str());
  }
  return found_any;
}

// ---- Rule chains ----

/// Finds the rules that lead from a file that exists to one of the wanted extension. For each
/// rule, in the order of the set, a chain that produces its input is preferred to the input itself.
///
/// An input that could not be had once is not tried again. That changes nothing: the attempt has
/// gone through every rule from which its extension can be reached, and met none of the rules on
/// its path, or it would have ended in a loop report. So none of those rules leads to it, from
/// wherever it is wanted next, and the outcome is again that there is no such file. Only another
/// spelling of the extension is another file.
short LA_LAUNCHER::plan_chain(lookup& where, const char* wanted, unsigned char* visited,
                              found_file& source, DARRAY_LA_RULE_CONST_PTR& chain) {
  // On each level the rule that is being tried; NONE after the last that produces what is needed.
  std::vector<int> path;
  path.reserve(8);  // Few chains are longer.
  path.push_back(index->first_producer(wanted));
  std::vector<char> failed(index->num_spellings());
  const auto try_next = [&path, this] { path.back() = index->next_producer(path.back()); };

  while (path.back() != la_rule_index::NONE || path.size() > 1) {
    if (is_interrupted(where.given)) return LA_FAILED;
    if (path.back() == la_rule_index::NONE) {
      // No rule produces the input of the rule one level up: perhaps it is there.
      path.pop_back();
      const int needing = path.back();
      visited[needing] = 0;
      if (find_input(where, *rules->rules.elements[needing], source)) {
        for (auto used = path.rbegin(); used != path.rend(); ++used) {
          visited[*used] = 0;
          chain.append(rules->rules.elements[*used]);
        }
        for (const int used : path) note_taken(used);
        return LA_FOUND;
      }
      note(needing, named_found ? LA_EXPLANATION::NOT_WHAT_IS_NAMED : LA_EXPLANATION::NO_SOURCE);
      failed[index->spelling(needing)] = true;
      try_next();
      continue;
    }
    const int i = path.back();
    const LA_RULE& rule = *rules->rules.elements[i];
    if (visited[i]) {
      report_loop(visited);
      for (const int used : path) {
        if (visited[used]) note(used, LA_EXPLANATION::IN_A_LOOP);
        visited[used] = 0;
      }
      return LA_FAILED;
    }
    const char* only_name = rule.netlist_file->get_name();
    const bool for_another = only_name != nullptr && !where.given.match_name(only_name);
    if (for_another || failed[index->spelling(i)]) {
      note(i, for_another   ? LA_EXPLANATION::FOR_ANOTHER_NAME
              : named_found ? LA_EXPLANATION::NOT_WHAT_IS_NAMED
                            : LA_EXPLANATION::NO_SOURCE);
      try_next();
      continue;
    }
    visited[i] = 1;
    path.push_back(index->first_producer_for(i));
  }
  return LA_NOT_FOUND;
}

/// Adds a rule that was considered to the explanation.
void LA_LAUNCHER::note(int rule, LA_EXPLANATION::VERDICT verdict) const {
  if (explanation != nullptr) explanation->rules.push_back({rules->rules.elements[rule], verdict});
}

/// Adds a rule of the chain, and those that need not be considered any more.
void LA_LAUNCHER::note_taken(int rule) const {
  if (explanation == nullptr) return;
  note(rule, LA_EXPLANATION::TAKEN);
  while ((rule = index->next_producer(rule)) != la_rule_index::NONE) {
    note(rule, LA_EXPLANATION::NOT_NEEDED);
  }
}

/// Looks for the file that a rule reads. Where the user named a file, it is that or none.
bool LA_LAUNCHER::find_input(lookup& where, const LA_RULE& rule, found_file& source) {
  const char* ext = rule.netlist_file->get_ext();
  if (!named_found) return find_file(where, ext, source);
  if (!named_file.file.match_ext(ext)) return false;
  source = named_file;
  return true;
}

void LA_LAUNCHER::report_loop(const unsigned char* visited) {
  message().issueError("The following rules define a loop:\n");
  for (int i = 0; i < rules->rules.count; ++i) {
    if (visited[i]) rules->rules.elements[i]->dump(false);
  }
  ++errors;
}

// ---- Build decision and step loop ----

namespace {

/// How a decision is reported, with the name of the output. Those of -3 and 0 are not status
/// messages.
struct decision_report {
  LA_BUILD_DECISION decision;
  bool only_detail;
  const char* text;
};
constexpr char OUT_OF_DATE[] = "Launcher: %s being compiled because it is out of date\n";
constexpr char MISSING[] = "Launcher: %s being compiled because it does not exist\n";
constexpr decision_report REPORTS[] = {
    {LA_BUILD_UP_TO_DATE, false, "Launcher: %s is up to date\n"},
    {LA_BUILD_SKIPPED, false, "Launcher: NOT compiling %s because of ignore timestamp flag\n"},
    {LA_BUILD_FORCED, true, "Launcher: %s being compiled because of force flag\n"},
    {LA_BUILD_MISSING, true, MISSING},
    {LA_BUILD_OUT_OF_DATE, true, OUT_OF_DATE},
    {LA_BUILD_AFTER_REBUILD, true, OUT_OF_DATE},
    {LA_BUILD_NO_TIMESTAMP, true,
     "Launcher: %s being compiled because the time stamps could not be determined\n"},
};

}  // namespace

/// The step of a chain that is being carried out. decision moves on from step to step.
struct LA_LAUNCHER::build_step {
  const LA_FULLFILE& source;
  const LA_RULE* rule;
  const LA_RULE* rule_before;  ///< whose output is the input; null in the first step
  const char* output;
  LA_BUILD_DECISION decision;
  /// What is known of the files. None is asked for twice, if no netlister runs.
  Port::FileStatus input_status;
  Port::FileStatus output_status = {};
  /// The dependency file that is newer than the output.
  std::string dependency = {};
  Port::FileStatus dependency_status = {};
};

/// The current directory of the process during a chain: back home at its end, whatever happens.
class LA_LAUNCHER::working_directory {
 public:
  /// home: the directory that is current.
  explicit working_directory(const LA_DIR& home) : home_(home) {}
  working_directory(const working_directory&) = delete;
  working_directory& operator=(const working_directory&) = delete;
  ~working_directory() { leave(); }

  void enter(const LA_DIR& directory) {
    if (!left_) left_.emplace();
    directory.chdir();
  }
  bool is_home() const { return !left_; }
  /// Goes home.
  void leave() {
    // A netlister may have moved or removed the directory of that name.
    if (left_ && !left_->enter()) home_.chdir();
  }

 private:
  const LA_DIR& home_;
  std::optional<Port::Place> left_;
};

/// What the runs of a chain have in common.
struct LA_LAUNCHER::shared_by_runs {
  explicit shared_by_runs(const LA_LAUNCHER& launcher) : directory(launcher.home) {
    launcher.set_options(options);
  }

  working_directory directory;
  la_command_options options;
};

short LA_LAUNCHER::build_chain(const found_file& source, const DARRAY_LA_RULE_CONST_PTR& chain,
                               unsigned char top, char* netlist_path) {
  std::optional<shared_by_runs> shared;
  const LA_FILE tail(source.file.get_tail());
  LA_FULLROOT outputs(*output_dir, tail.get_root());
  build_step step = {
      source.file,  nullptr, nullptr, nullptr, force ? LA_BUILD_FORCED : LA_BUILD_UNDECIDED,
      source.status};
  for (const LA_RULE* rule : chain) {
    if (is_interrupted(source.file)) return LA_FAILED;
    step.rule_before = std::exchange(step.rule, rule);
    if (detail) message().issueStatus("Launcher: Using rule %s\n", rule->rule_name.get());
    step.output = outputs.with_ext(rule->target->get_ext());
    if (step.output == nullptr) {
      message().issueError(
          "Launcher: The output of rule %s for %s has no name of at most %d characters in the "
          "output directory, or there is none.\n",
          rule->rule_name.get(), source.file.get_tail(), LA_MAX_PATH - 1);
      ++errors;
      return LA_FAILED;
    }
    decide(step);
    note(step);
    if (!report_decision(step)) return LA_FAILED;
    if (step.decision > LA_BUILD_UNDECIDED) {
      if (!shared) shared.emplace(*this);
      if (!run_netlister(step, *shared, top)) return LA_FAILED;
      step.decision = LA_BUILD_AFTER_REBUILD;
      step.output_status = {};  // What was known of it is no longer true.
    }
    step.input_status = std::exchange(step.output_status, {});
  }
  UT_STR::Copy(netlist_path, step.output);
  netlist_seen = step.decision < LA_BUILD_UNDECIDED;
  return LA_FOUND;
}

/// The file that a rule of a chain makes.
LA_FULLFILE LA_LAUNCHER::output_of(const LA_FULLFILE& source, const LA_RULE& rule) const {
  LA_FULLFILE output(*output_dir, source.get_tail());
  output.set_ext(rule.target->get_ext());
  return output;
}

LA_FULLFILE LA_LAUNCHER::input_of(const build_step& step) const {
  return step.rule_before != nullptr ? output_of(step.source, *step.rule_before) : step.source;
}

/// Sets every keyword but those of a step's files.
void LA_LAUNCHER::set_options(la_command_options& options) const {
  std::unique_ptr<PM_PIC> device;
  if (part_name != nullptr) {
    device = std::make_unique<PM_PIC>(part_name, 1, PM_PARTNAME_BINDING(0));
  }
  options.set_keyword("part", part_name);
  options.set_keyword("family", device ? device->get_family() : nullptr);
  options.set_keyword("device", device ? device->get_device() : nullptr);
  options.set_keyword("pkg", device ? device->get_package() : nullptr);
  options.set_keyword("speed", device ? device->get_speed() : nullptr);
  options.set_keyword("ignore_locs", ignore_locs);
  options.set_keyword("add_pads", add_pads);
  options.set_keyword("quiet", quiet);
  options.set_keyword("aul", aul);
  const char* directory = output_dir->get_dir();
  options.set_name("OUTPUT", directory != nullptr ? directory : "");
  if (num_libraries == 0) options.set_keyword("libraries", nullptr);
  for (const la_text& library : counted(libraries, num_libraries)) {
    options.add_name("libraries", library.get());
  }
}

/// Compares the rule's dependency files, which lie beside the source, with the output.
LA_BUILD_DECISION LA_LAUNCHER::decide_by_dependency_files(build_step& step) const {
  if (!step.rule->has_dependency_files()) return LA_BUILD_UP_TO_DATE;
  for (const LA_FILE* dependency : *step.rule->dependency_files) {
    LA_FULLFILE file(step.source);
    if (dependency->get_ext() != nullptr) file.set_ext(dependency->get_ext());
    if (dependency->get_name() != nullptr) file.set_name(dependency->get_name());
    const Port::FileStatus status = status_at_home(file.get_fullfile());
    if (!status.exists || status.time <= step.output_status.time) continue;
    step.dependency = file.get_fullfile();
    step.dependency_status = status;
    return LA_BUILD_OUT_OF_DATE;
  }
  return LA_BUILD_UP_TO_DATE;
}

/// Decides whether the step's netlister must run.
void LA_LAUNCHER::decide(build_step& step) const {
  const LA_RULE& rule = *step.rule;
  step.dependency.clear();
  step.dependency_status = {};
  if (rule.netlister != nullptr && UT_STR::_Compare(rule.netlister, "NOT_SUPPORTED") == 0) {
    step.decision = LA_BUILD_UNSUPPORTED;
    return;
  }
  if (step.decision == LA_BUILD_FORCED || step.decision == LA_BUILD_AFTER_REBUILD) return;
  step.output_status = status_at_home(step.output);  // No netlister has run yet.
  if (!step.output_status.exists) {
    step.decision = LA_BUILD_MISSING;
    return;
  }
  if (ignore_timestamps) {
    step.decision = LA_BUILD_SKIPPED;
    return;
  }
  if (!step.input_status.exists) {
    step.decision = LA_BUILD_NO_TIMESTAMP;
  } else if (step.input_status.time > step.output_status.time) {
    step.decision = LA_BUILD_OUT_OF_DATE;
  } else {
    step.decision = decide_by_dependency_files(step);
  }
}

/// Adds the step to the explanation.
void LA_LAUNCHER::note(const build_step& step) const {
  if (explanation == nullptr) return;
  explanation->steps.push_back({step.rule, input_of(step).get_fullfile(), step.output,
                                step.input_status, step.output_status, step.dependency,
                                step.dependency_status, step.decision, ""});
}

/// Reports the decision. False when it ends the chain.
bool LA_LAUNCHER::report_decision(const build_step& step) {
  if (step.decision == LA_BUILD_UNSUPPORTED) {
    message().issueError(
        "Launcher: Netlist format of %s is no longer supported, could not create %s\n",
        input_of(step).get_fullfile(), tail_of(step.output));
    ++errors;
    return false;
  }
  for (const decision_report& report : REPORTS) {
    if (report.decision != step.decision || (report.only_detail && !detail)) continue;
    const bool gone = step.decision == LA_BUILD_AFTER_REBUILD && !status_of(step.output).exists;
    message().issueStatus(gone ? MISSING : report.text, tail_of(step.output));
  }
  return true;
}

// ---- Netlister run ----

namespace {

/// A file as an argument: quoted, and not to be taken for an option. Empty when it does not fit.
std::string argument_of(const LA_FULLFILE& file) {
  const char* path = file.get_external_path();
  std::string argument(path != nullptr ? path : "");
  if (argument.starts_with("\"-")) argument.insert(1, "./");
  return argument;
}

}  // namespace

/// Runs the step's netlister and judges how it ended. False when the chain ends here.
bool LA_LAUNCHER::run_netlister(const build_step& step, shared_by_runs& shared, unsigned char top) {
  auto& [directory, options] = shared;
  if (home.get_dir() == nullptr) {
    message().issueError(
        "Launcher: The current directory is gone, too long, or has a backslash in its name: %s is "
        "not run.\n",
        step.rule->netlister.get());
    ++errors;
    return false;
  }
  const LA_FULLFILE input = input_of(step);
  const LA_FULLFILE output = output_of(step.source, *step.rule);
  const Port::FileStatus before =
      directory.is_home() ? status_at_home(step.output) : status_of(step.output);
  enter_directory(*step.rule, input, output, directory);
  std::string command;
  if (!make_command(*step.rule, input, output, options, top, command)) return false;
  message().issueStatus("Launcher: Executing %s\n", command.c_str());
  ++runs;
  if (explanation != nullptr) explanation->steps.back().command = command;
  if (Port_Env::GetEnv("LA_TEST") != nullptr) return true;
  if (execute(*step.rule, command)) return true;
  directory.leave();
  distrust(step.output, before);
  return false;
}

/// Sees to it that what a failed run has written is not taken for up to date later: it gets the
/// oldest time stamp that there is. Its content stays for whoever wants to look into it. The
/// current directory is home.
void LA_LAUNCHER::distrust(const char* output, const Port::FileStatus& before) {
  // A netlister may have moved home, or put another directory in its place.
  const char* file = status_of(output).exists ? output : at_home(output);
  const Port::FileStatus after = status_of(file);
  if (!after.exists || (before.exists && after.time == before.time)) return;
  if (Port::File::setoldest(file)) {
    if (!detail) return;
    message().issueStatus(
        "Launcher: %s comes from a failed run, its time stamp is set back: it will be made again\n",
        tail_of(output));
    return;
  }
  // The time stamp of another user's file cannot be set.
  const bool is_removed = Port::File::remove(file);
  message().issueWarning(
      "Launcher: %s comes from a failed run, and its time stamp could not be set back: %s\n",
      tail_of(output), is_removed ? "it is removed" : "remove it");
  ++warnings;
}

/// Goes to the directory that the rule asks for. Where it cannot be entered, the netlister runs
/// where the process stands.
void LA_LAUNCHER::enter_directory(const LA_RULE& rule, const LA_FULLFILE& input,
                                  const LA_FULLFILE& output, working_directory& directory) const {
  const char* name = nullptr;
  switch (rule.netlister_dir_flag) {
    case DIR_UNSET:
    case DIR_NONE:
      name = home.get_dir();
      break;
    case DIR_SOURCE:
      name = input.get_fullhead();
      break;
    case DIR_OUTPUT:
      name = output.get_fullhead();
      break;
    default:
      name = rule.netlister_dir ? rule.netlister_dir->get_dir() : nullptr;
  }
  const LA_DIR chosen(name);
  directory.enter(chosen);
  if (!detail) return;

  const char* netlister = rule.netlister;
  message().issueStatus("Launcher: Running %s from %s\n", netlister, chosen.get_dir());
  message().issueStatus("Launcher: Environment inherited by %s will be:\n", netlister);
  for (const char* variable : {"MYCORVANE", "CORVANE", "PATH"}) {
    const char* value = Port_Env::GetEnv(variable);
    message().issueStatus("Launcher:    %s is %s\n", variable, value != nullptr ? value : "unset");
  }
}

/// Makes the command line of the step.
bool LA_LAUNCHER::make_command(const LA_RULE& rule, const LA_FULLFILE& input,
                               const LA_FULLFILE& output, la_command_options& options,
                               unsigned char top, std::string& command) {
  const char* options_template = top && rule.netlister_top_options != nullptr
                                     ? rule.netlister_top_options
                                     : rule.netlister_options;
  if (options_template == nullptr) options_template = "";
  const std::string infile = argument_of(input);
  const std::string outfile = argument_of(output);
  if (infile.empty() || outfile.empty()) {
    message().issueError("Launcher: The name of %s is too long for a command line.\n",
                         infile.empty() ? input.get_tail() : output.get_tail());
    ++errors;
    return false;
  }
  options.set_name("infile", infile);
  options.set_name("outfile", outfile);

  char expanded[LA_MAX_OPTIONS];
  if (!options.expand(options_template, expanded)) {
    message().issueError("Could not expand option string \"%s\"\n", expanded);
    errors += 2;
    return false;
  }
  const std::string start = std::string(rule.netlister ? rule.netlister.get() : "") + " ";
  command = start + expanded;
  if (options.keep_names_in_place(start, options_template, command)) return true;
  message().issueError(
      "Launcher: The name of a file or directory, or a library entry, would change the arguments "
      "of %s, which is therefore not run: %s\n",
      rule.netlister.get(), command.c_str());
  ++errors;
  return false;
}

/// Runs a command line and judges its exit code by the rule.
bool LA_LAUNCHER::execute(const LA_RULE& rule, const std::string& command) {
  La_Port_Process process(2);
  const Port_Process::PROCESS_STATUS status = process.Run(command.c_str());
  if (Port_Interrupt::Requested() != 0) {
    // Whatever its exit code says: it may have been cut short.
    message().issueError("Launcher: %s was interrupted.\n", rule.netlister.get());
    ++errors;
    return false;
  }
  if (status != Port_Process::PROCESS_ENDED) {
    message().issueError("Failed to launch program %z\n", process.GetProcessErrmsg());
    ++errors;
    return false;
  }
  const int exit_code = process.GetChildRetcode();
  if (detail) {
    message().issueStatus("Launcher: %s exited with an exit code of %d\n", rule.netlister.get(),
                          exit_code);
  }
  if (rule.netlister_result(exit_code) != LA_FATAL) return true;
  message().issueError("%s exited with errors (return code %d).\n", rule.netlister.get(),
                       exit_code);
  ++errors;
  return false;
}
