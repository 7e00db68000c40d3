#include "launcher/baslauncher.h"

#include <algorithm>
#include <climits>
#include <exception>
#include <iterator>
#include <optional>
#include <span>
#include <utility>

#include "host/port_env.h"
#include "host/port_init.h"
#include "launcher/chain.h"
#include "launcher/home.h"
#include "launcher/lookup.h"
#include "launcher/message.h"
#include "launcher/planner.h"
#include "launcher/rule_index.h"
#include "rules/baslarules.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.13 $";

/// The elements of an array that is kept with its count.
template <class Element>
std::span<const Element> counted(const std::unique_ptr<Element[]>& array, short count) {
  return {array.get(), array != nullptr ? static_cast<std::size_t>(count) : 0};
}

/// A file that needs no rule.
struct native_file {
  la_found_file found;
  bool is_kbo;  ///< and the user did not ask for .kbc
};

/// Looks for NAME.kbo, then for NAME.kbc; for the latter only when the user named that, by kbc.
std::optional<native_file> find_native(la_lookup& where, const char* kbc) {
  la_found_file found;
  const bool is_first = where.find_file(kbc != nullptr ? kbc : "kbo", found);
  if (!is_first && !where.find_file("kbc", found)) return {};
  return native_file{std::move(found), is_first && kbc == nullptr};
}

/// Whether a netlist can be looked for by this name; if not, says why.
bool is_usable(const LA_FULLFILE& given, const char* name, const LA_DIR& home) {
  const bool fits = UT_STR::Len(name) < LA_MAX_PATH;
  if (fits && given.get_name() == nullptr) {
    la_launcher_message().issueError("No base name given in netlist specification \"%s\".\n", name);
    return false;
  }
  if (fits && given.get_fullfile() != nullptr) return true;
  if (fits && home.get_dir() == nullptr) {
    la_launcher_message().issueError(
        "Launcher: The current directory cannot be used for netlist \"%s\": it is gone, too long, "
        "or has a backslash in its name.\n",
        name);
  } else {
    la_launcher_message().issueError(
        "Launcher: The full name of netlist \"%s\" is longer than %d characters.\n", name,
        LA_MAX_PATH - 1);
  }
  return false;
}

/// Reports a loop: the rules in it and those that led to it, in the order of the set.
void report_loop(std::vector<int> path, const la_rule_index& rules, const la_report& report) {
  path.pop_back();  // It is in front, too.
  std::sort(path.begin(), path.end());
  la_launcher_message().issueError("The following rules define a loop:\n");
  for (const int rule : path) rules[rule].dump(false);
  ++report.errors;
}

void report_bad_setup(const std::exception& failure) {
  la_launcher_message().issueError("Launcher: Could not be set up: %s\n", failure.what());
}

/// Adds what was planned to the explanation.
void explain(const la_plan& plan, bool is_named, const la_rule_index& rules, LA_EXPLANATION& why) {
  for (LA_EXPLANATION::CONSIDERED& considered : why.rules) {
    if (is_named && considered.verdict == LA_EXPLANATION::NO_SOURCE) {
      considered.verdict = LA_EXPLANATION::NOT_WHAT_IS_NAMED;
    }
  }
  if (plan.loop.empty()) return;
  const auto start = std::find(plan.loop.begin(), plan.loop.end(), plan.loop.back());
  std::transform(start, plan.loop.end(), std::back_inserter(why.loop),
                 [&](int rule) { return &rules[rule]; });
}

}  // namespace

Port_MsgManData& la_launcher_message(int line) {
  return Port_MsgManData::createObject("Kestrel", "launcher/baslauncher.cpp", line, revision);
}

void La_Port_Process::Output(const char* text) {
  la_launcher_message().issueStatusText(text);
}

void La_Port_Process::Pause() {
  Port_MsgManData::flush();
}

/// What finds have beside the fields of the launcher.
struct LA_LAUNCHER::la_finding {
  explicit la_finding(const LA_RULE_SET& set) : rules(set.rules) {}

  la_rule_index rules;
  la_home home;
  std::vector<LA_FULLROOT> searchpaths;  ///< those of the launcher, as far as finds have used them
  // Of the last find.
  bool is_netlist_seen = false;
  std::vector<LA_RUN> runs;
  // What the host has asked to be told.
  LA_EXPLANATION* why = nullptr;
  la_ask_host ask_host;
};

LA_LAUNCHER::LA_LAUNCHER(const char* part_name, const char** searchpaths, short num_searchpaths,
                         const char** libraries, short num_libraries, const char* output_dir,
                         const char* user_rules_file, unsigned char force,
                         unsigned char ignore_timestamps, unsigned char ignore_locs,
                         unsigned char add_pads, unsigned char quiet, unsigned char aul)
    : detail(Port_Env::GetEnv("LAUNCHER_DETAIL") != nullptr),
      force(force),
      ignore_timestamps(ignore_timestamps) {
  try {
    if (searchpaths != nullptr) append_searchpaths(searchpaths, num_searchpaths);
    if (libraries != nullptr) {
      this->libraries.reset(new la_text[static_cast<std::size_t>(num_libraries)]);
      this->num_libraries = num_libraries;
      std::copy(libraries, libraries + num_libraries, this->libraries.get());
    }
    this->output_dir = std::make_unique<LA_DIR>(output_dir);
    this->part_name = la_text(part_name);
    this->ignore_locs = la_text(ignore_locs ? "-r" : nullptr);
    this->add_pads = la_text(add_pads ? "-a" : nullptr);
    this->quiet = la_text(quiet ? "-quiet" : nullptr);
    this->aul = la_text(aul ? "-aul" : nullptr);
    rules = std::make_unique<LA_RULE_SET>(part_name, user_rules_file);
    finding = std::make_unique<la_finding>(*rules);
    ok = rules->is_valid;
  } catch (const std::exception& failure) {
    report_bad_setup(failure);
  }
}

LA_LAUNCHER::~LA_LAUNCHER() = default;

void LA_LAUNCHER::add_searchpaths(const char** new_paths, short num_new_paths) {
  try {
    append_searchpaths(new_paths, num_new_paths);
  } catch (const std::exception& failure) {
    report_bad_setup(failure);
  }
}

/// As add_searchpaths, but may throw.
void LA_LAUNCHER::append_searchpaths(const char** new_paths, short num_new_paths) {
  const int total = num_searchpaths + num_new_paths;
  if (total > SHRT_MAX) {
    la_launcher_message().issueError("Launcher: There can be at most %d search directories.\n",
                                     SHRT_MAX);
    return;
  }
  std::unique_ptr<std::unique_ptr<LA_DIR>[]> paths(
      new std::unique_ptr<LA_DIR>[static_cast<std::size_t>(total)]);
  std::transform(new_paths, new_paths + num_new_paths, paths.get() + num_searchpaths,
                 [](const char* path) { return std::make_unique<LA_DIR>(path); });
  std::move(searchpaths.get(), searchpaths.get() + num_searchpaths, paths.get());
  searchpaths = std::move(paths);
  num_searchpaths = static_cast<short>(total);
}

short LA_LAUNCHER::find(const char* name, char* source_path, char* netlist_path,
                        unsigned char top) {
  source_path[0] = '\0';
  netlist_path[0] = '\0';
  if (!finding) {
    ++errors;
    return LA_FAILED;
  }
  finding->is_netlist_seen = false;
  finding->runs.clear();
  try {
    if (Port_Env::GetEnv("LA_DISABLE") != nullptr) return find_disabled(name, netlist_path);
    return find_enabled(name, source_path, netlist_path, top);
  } catch (const std::exception& failure) {
    la_launcher_message().issueError("Launcher: Could not resolve %s: %s\n", name, failure.what());
    ++errors;
    source_path[0] = '\0';
    netlist_path[0] = '\0';
    return LA_FAILED;
  }
}

bool LA_LAUNCHER::saw_netlist() const {
  return finding && finding->is_netlist_seen;
}

const std::vector<LA_RUN>& LA_LAUNCHER::last_runs() const {
  static const std::vector<LA_RUN> NONE;
  return finding ? finding->runs : NONE;
}

void LA_LAUNCHER::explain_to(LA_EXPLANATION* to) {
  if (finding) finding->why = to;
}

void LA_LAUNCHER::ask_before_chains(unsigned char (*may_build)(void* context,
                                                               const char* const* files, int count),
                                    void* context) {
  if (!finding) return;
  finding->ask_host = nullptr;
  if (may_build == nullptr) return;
  finding->ask_host = [may_build, context](const std::vector<const char*>& files) {
    return may_build(context, files.data(), static_cast<int>(files.size())) != 0;
  };
}

/// Looks for the name in lower case, without rules and messages.
short LA_LAUNCHER::find_disabled(const char* name, char* netlist_path) {
  char lower_name[LA_MAX_PATH];
  if (UT_STR::Copy(lower_name, name) == nullptr) return LA_NOT_FOUND;
  UT_STR::Lower(lower_name);
  const auto look_in = [&](const char** dirs, int count) {
    const char* found = Port::File::find(lower_name, dirs, count, netlist_path);
    return found != nullptr && !Port::File::status(found).is_left_by_failed_run();
  };
  bool is_found = num_searchpaths == 0 && look_in(nullptr, 0);
  for (int i = 0; i < num_searchpaths && !is_found; ++i) {
    const char* dir = searchpaths[static_cast<std::size_t>(i)]->get_dir();
    is_found = look_in(&dir, 1);
  }
  if (!is_found) netlist_path[0] = '\0';
  finding->is_netlist_seen = is_found;
  return is_found ? LA_FOUND : LA_NOT_FOUND;
}

short LA_LAUNCHER::find_enabled(const char* name, char* source_path, char* netlist_path,
                                unsigned char top) {
  const la_report report = {detail != 0, errors, warnings};
  const la_rule_index& index = finding->rules;
  la_home& home = finding->home;
  std::vector<LA_FULLROOT>& places = finding->searchpaths;
  LA_EXPLANATION* const why = finding->why;
  home.settle();
  LA_FULLFILE given(home.dir(), name);
  const bool named_kbc = given.match_ext("kbc");
  if (given.match_ext("kbo")) given.set_ext(nullptr);
  if (!is_usable(given, name, home.dir())) {
    ++errors;
    return LA_FAILED;
  }
  if (is_interrupted(given, report)) return LA_FAILED;

  for (const auto& directory : counted(searchpaths, num_searchpaths).subspan(places.size())) {
    places.emplace_back(*directory);
  }
  la_lookup where(given, places, home, why);
  const Port::FileStatus named_status = find_named(given, where);
  const auto find_input = [&](const char* ext, la_found_file& found) {
    if (!named_found) return where.find_file(ext, found);
    // The user named a file: it is that or none.
    const bool is_named = named_file.match_ext(ext);
    if (is_named) found = {named_file, named_status};
    return is_named;
  };
  la_plan plan;
  plan_chain(index, given.get_name(), "kbo", find_input, why != nullptr ? &why->rules : nullptr,
             plan);
  if (why != nullptr) explain(plan, named_found, index, *why);

  switch (plan.outcome) {
    case la_plan::CHAIN:
      return carry_out(plan, top, source_path, netlist_path);
    case la_plan::LOOP:
      report_loop(plan.loop, index, report);
      return LA_FAILED;
    case la_plan::INTERRUPTED:
      is_interrupted(given, report);
      return LA_FAILED;
    case la_plan::NOTHING:
      break;
  }
  const std::optional<native_file> native =
      find_native(where, named_kbc ? given.get_ext() : nullptr);
  if (!native) return LA_NOT_FOUND;
  const LA_FULLFILE& file = native->found.file;
  if (native->is_kbo) {
    la_launcher_message().issueStatus(
        "Launcher: NOT compiling %s because its source was not found\n", file.get_tail());
  }
  UT_STR::Copy(netlist_path, file.get_fullfile());
  UT_STR::Copy(source_path, netlist_path);
  finding->is_netlist_seen = true;
  return LA_FOUND;
}

/// Looks for the very file that the user named with an extension, and returns what is known of it.
Port::FileStatus LA_LAUNCHER::find_named(const LA_FULLFILE& given, la_lookup& where) {
  named_found = 0;
  named_file.set_file();
  const char* ext = given.get_ext();
  if (ext == nullptr) return {};
  la_found_file found;
  named_found = where.find_file(ext, found);
  if (!named_found) {
    la_launcher_message().issueWarning(
        "Launcher: Could not find file %s with extension %s in the search path. Ignoring "
        "extension.\n",
        given.get_fullroot(), ext);
    ++warnings;
  }
  named_file = std::move(found.file);
  return found.status;
}

/// Carries out a chain.
short LA_LAUNCHER::carry_out(const la_plan& plan, unsigned char top, char* source_path,
                             char* netlist_path) {
  const la_build_settings settings = {*output_dir,
                                      force != 0,
                                      ignore_timestamps != 0,
                                      part_name,
                                      counted(libraries, num_libraries),
                                      ignore_locs,
                                      add_pads,
                                      quiet,
                                      aul};
  la_built_chain built =
      build_chain(plan.source, plan.chain, top != 0, settings, finding->home, finding->ask_host,
                  {detail != 0, errors, warnings}, finding->why);
  runs += static_cast<int>(built.runs.size());
  finding->runs = std::move(built.runs);
  finding->is_netlist_seen = built.is_seen;
  if (!built.is_complete) return LA_FAILED;
  UT_STR::Copy(netlist_path, built.netlist.c_str());
  UT_STR::Copy(source_path, plan.source.file.get_fullfile());
  return LA_FOUND;
}
