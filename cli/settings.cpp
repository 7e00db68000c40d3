#include "cli/settings.h"

#include <algorithm>
#include <climits>
#include <set>
#include <string_view>

#include "cli/nearest.h"

namespace {

constexpr option OPTIONS[] = {
    {"-p", "--part", "PART", "device part name",
     [](settings& to, const char* text) { to.part = text; }},
    {"-sd", "--search-dir", "DIR", "search directory; may be repeated, in order",
     [](settings& to, const char* text) { to.search_dirs.emplace_back(text); }},
    {"-l", "--library", "TEXT", "library entry; may be repeated",
     [](settings& to, const char* text) { to.libraries.push_back(text); }},
    {"-o", "--output-dir", "DIR", "where netlisters write (default: here)",
     [](settings& to, const char* text) { to.output_dir = text; }},
    {"-u", "--user-rules", "FILE", "user rules file (extension urf by default)",
     [](settings& to, const char* text) { to.user_rules = text; }},
    {"-f", "--force", nullptr, "rebuild whatever the time stamps say",
     [](settings& to, const char*) { to.force = true; }},
    {"-i", "--ignore-timestamps", nullptr, "never rebuild a file that exists",
     [](settings& to, const char*) { to.ignore_timestamps = true; }},
    {"-r", "--ignore-locs", nullptr, "give netlisters the switch -r",
     [](settings& to, const char*) { to.ignore_locs = true; }},
    {"-a", "--add-pads", nullptr, "give netlisters the switch -a",
     [](settings& to, const char*) { to.add_pads = true; }},
    {"-q", "--quiet", nullptr, "give netlisters the switch -quiet",
     [](settings& to, const char*) { to.quiet = true; }},
    {nullptr, "--aul", nullptr, "give netlisters the switch -aul",
     [](settings& to, const char*) { to.aul = true; }},
    {nullptr, "--not-top", nullptr, "the netlists named are not top-level ones",
     [](settings& to, const char*) { to.top = false; }},
    {nullptr, "--names-from", "FILE", "read more names from FILE (\"-\": standard input)",
     [](settings& to, const char* text) { to.names_files.push_back(text); }},
    {"-n", "--dry-run", nullptr, "announce the commands, start nothing",
     [](settings& to, const char*) { to.dry_run = true; }},
    {"-d", "--detail", nullptr, "say why, and from where",
     [](settings& to, const char*) { to.detail = true; }},
    {"-e", "--explain", nullptr, "tell what would be done, and why; start nothing",
     [](settings& to, const char*) { to.what = task::EXPLAIN; }},
    {nullptr, "--json", nullptr, "results as JSON, one object per line",
     [](settings& to, const char*) { to.json = true; }},
    {nullptr, "--check", nullptr, "load and check the rules, resolve nothing",
     [](settings& to, const char*) { to.what = task::CHECK; }},
    {nullptr, "--strict", nullptr, "with --check: a hint is a failure, too",
     [](settings& to, const char*) { to.strict = true; }},
    {nullptr, "--list-rules", nullptr, "print the completed rules (--detail: all fields)",
     [](settings& to, const char*) { to.what = task::LIST_RULES; }},
    {nullptr, "--graph", nullptr, "print the rules as a graph for Graphviz",
     [](settings& to, const char*) { to.what = task::GRAPH; }},
    {nullptr, "--list-parts", nullptr, "print the device parts that are known",
     [](settings& to, const char*) { to.what = task::LIST_PARTS; }},
    {nullptr, "--completion", "SHELL", "print completions for a shell: bash or zsh",
     [](settings& to, const char* text) {
       to.what = task::COMPLETION;
       to.shell = text;
     }},
    {nullptr, "--debug", nullptr, "show debug traces",
     [](settings& to, const char*) { to.debug = true; }},
    {"-h", "--help", nullptr, "print this help",
     [](settings& to, const char*) { to.what = task::HELP; }},
    {"-V", "--version", nullptr, "print the version",
     [](settings& to, const char*) { to.what = task::VERSION; }},
};

std::string unknown_option(const std::string& name) {
  std::set<std::string> names;
  for (const option& o : OPTIONS) names.insert(o.long_name);
  return "unknown option " + name + did_you_mean(nearest_few(name, names));
}

/// One command line on its way into settings.
class command_line {
 public:
  command_line(int count, const char* const* words, settings& to)
      : rest_(words, static_cast<std::size_t>(count)), to_(to) {}

  std::string read() {
    while (!rest_.empty()) {
      const char* word = take();
      if (std::string_view(word) == "--") break;
      if (word[0] != '-' || word[1] == '\0') {
        to_.names.emplace_back(word);
        continue;
      }
      if (std::string wrong = read_option(word); !wrong.empty()) return wrong;
    }
    to_.names.insert(to_.names.end(), rest_.begin(), rest_.end());
    return {};
  }

 private:
  const char* take() {
    const char* word = rest_.front();
    rest_ = rest_.subspan(1);
    return word;
  }

  /// Reads an option with its argument, which follows "=" or is the next word.
  std::string read_option(const char* word) {
    const std::string_view text(word);
    const bool is_long = text.starts_with("--");
    const std::size_t equals = is_long ? text.find('=') : text.npos;
    const std::string name(text.substr(0, equals));
    const option* known =
        std::find_if(std::begin(OPTIONS), std::end(OPTIONS), [&](const option& o) {
          return name == (is_long ? o.long_name : o.short_name != nullptr ? o.short_name : "");
        });
    if (known == std::end(OPTIONS)) return unknown_option(name);
    if (known->argument == nullptr && equals != text.npos) return name + " takes no argument";
    const char* argument = nullptr;
    if (equals != text.npos) {
      argument = word + equals + 1;
    } else if (known->argument != nullptr) {
      if (rest_.empty()) return name + " needs an argument: " + known->argument;
      argument = take();
    }
    known->apply(to_, argument);
    return {};
  }

  std::span<const char* const> rest_;
  settings& to_;
};

}  // namespace

bool takes_names(task what) {
  return what == task::RESOLVE || what == task::EXPLAIN;
}

std::span<const option> all_options() {
  return OPTIONS;
}

std::string read_command_line(int count, const char* const* words, settings& to) {
  if (std::string wrong = command_line(count, words, to).read(); !wrong.empty()) return wrong;
  // The launcher counts both in 16 bits.
  if (to.search_dirs.size() > SHRT_MAX) return "there are too many search directories";
  if (to.libraries.size() > SHRT_MAX) return "there are too many library entries";
  if (takes_names(to.what) && to.names.empty() && to.names_files.empty()) {
    return "no netlist is named";
  }
  return {};
}

std::string help_text() {
  std::string text =
      "Usage: kestrel-launch [OPTION]... NAME...\n"
      "Finds the file to read for each netlist NAME, and makes it where it is missing\n"
      "or out of date. Prints its path.\n\n";
  for (const option& o : OPTIONS) {
    std::string line = "  ";
    line += o.short_name != nullptr ? std::string(o.short_name) + "," : "";
    line.resize(7, ' ');
    line += o.long_name;
    if (o.argument != nullptr) line.append(" ").append(o.argument);
    line.resize(std::max<std::size_t>(line.size() + 2, 30), ' ');
    text += line + o.help + "\n";
  }
  text +=
      "\nAn option of two letters or more has two dashes, but for -sd. Names after \"--\"\n"
      "may begin with \"-\".\n\n"
      "Exit status: 0 every name was found; 1 at least one was not found; 2 an error\n"
      "was reported, the rules are not valid, or the command line is wrong.\n\n"
      "Example: kestrel-launch -p hx1k-tq144 -sd src -o build blinky\n";
  return text;
}
