// A host program of the library, for the workloads that are measured inside a process.
//
//   plan TIMES DIRECTORY...     plans for the name "top"; the output directory is out/
//   load [FILE]                 loads the rules
//   spawn MEGABYTES TIMES       starts the netlister of "top" over and over from a big process
//   output                      runs the netlister of "top", counts the lines that it prints
//   expand WAY TIMES            expands a template, by the library or as others would
#include <string>
#include <string_view>
#include <vector>

#include "bench/measure.h"
#include "host/port_msgman.h"
#include "launcher/baslauncher.h"
#include "optparse/baslaoptparse.h"

namespace {

using words = char**;

long messages = 0;
long message_bytes = 0;

void count_message(void* /*context*/, const Port_Msg& message) {
  if (message.level == PORT_MSG_ERROR) std::fputs(message.text, stderr);
  ++messages;
  message_bytes += static_cast<long>(std::strlen(message.text));
}

/// A launcher without part, libraries and switches.
struct plain_launcher : LA_LAUNCHER {
  plain_launcher(const char** dirs, std::size_t num_dirs, const char* rules, bool force)
      : LA_LAUNCHER(nullptr, dirs, static_cast<short>(num_dirs), nullptr, 0, "out", rules, force, 0,
                    0, 0, 0, 0) {
    require(ok, "the rules are not valid");
  }
  short find_top() {
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    return find("top", source, netlist, 1);
  }
};

void plan(words rest) {
  std::vector<const char*> dirs;
  for (words dir = rest + 1; *dir != nullptr; ++dir) dirs.push_back(*dir);
  plain_launcher launcher(dirs.data(), dirs.size(), nullptr, false);
  measure(std::atoi(rest[0]), [&launcher] { launcher.find_top(); });
  require(launcher.errors == 0, "planning failed");
}

void load(words rest) {
  alignas(plain_launcher) static char launcher[sizeof(plain_launcher)];
  measure(1, [&] { new (launcher) plain_launcher(nullptr, 0, *rest, false); });
}

void spawn(words rest) {
  grow(std::atoi(rest[0]));
  plain_launcher launcher(nullptr, 0, nullptr, true);
  measure(std::atoi(rest[1]), [&launcher] { launcher.find_top(); });
  require(launcher.errors == 0, "a start failed");
}

void output() {
  plain_launcher launcher(nullptr, 0, nullptr, true);
  measure(1, [&launcher] { launcher.find_top(); });
  require(messages > 32768, "lines are missing");
}

// ---- Templates ----

constexpr char TEMPLATE[] =
    "-p $part [-family $family] [-dev $device] [-pkg $pkg] [-speed $speed] {-l $libraries }"
    "[$ignore_locs] [$add_pads] [$quiet] [$aul] '-dir=$OUTPUT' -o $outfile -i $infile";
constexpr const char* KEYWORDS[] = {"part",    "family",      "device",   "pkg",   "speed",
                                    "OUTPUT",  "ignore_locs", "add_pads", "quiet", "aul",
                                    "outfile", "infile",      "libraries"};
constexpr const char* VALUES[] = {"hx8k-ct256-10",
                                  "ice40",
                                  "hx8k",
                                  "ct256",
                                  "10",
                                  "/home/user/work/projects/board-rev/out/",
                                  "-r",
                                  "-a",
                                  "-quiet",
                                  "-aul",
                                  "\"../out/receiver.kbo\"",
                                  "\"receiver.blif\"",
                                  "/home/user/libraries/cells"};
constexpr std::size_t NUM_KEYWORDS = std::size(KEYWORDS);

/// The values as the ways to expand get them: the compiler knows nothing of them.
const char* values[NUM_KEYWORDS];
char expanded[LA_MAX_PATH];

void by_library(const LA_KEYWORD_TABLE& table) {
  std::memcpy(expanded, TEMPLATE, sizeof TEMPLATE);
  table.expand(expanded);
}

char* put(char* to, std::string_view text) {
  std::memcpy(to, text.data(), text.size());
  return to + text.size();
}

/// The template as a compiler for it would write it.
void by_compiled_code() {
  char* to = put(put(expanded, "-p "), values[0]);
  static constexpr std::string_view FIRST[] = {" -family ", " -dev ", " -pkg ", " -speed "};
  for (std::size_t i = 0; i < 4; ++i) {
    if (values[i + 1] != nullptr) to = put(put(to, FIRST[i]), values[i + 1]);
  }
  to = put(to, " ");
  if (values[12] != nullptr) to = put(put(put(to, "-l "), values[12]), " ");
  for (std::size_t i = 6; i < 10; ++i) {
    if (values[i] != nullptr) to = put(put(to, values[i]), " ");
  }
  to = put(put(put(to, "'-dir="), values[5]), "' -o ");
  *put(put(put(to, values[10]), " -i "), values[11]) = '\0';
}

void by_snprintf() {
  std::snprintf(expanded, sizeof expanded,
                "-p %s -family %s -dev %s -pkg %s -speed %s -l %s %s %s %s %s '-dir=%s' -o %s -i "
                "%s",
                values[0], values[1], values[2], values[3], values[4], values[12], values[6],
                values[7], values[8], values[9], values[5], values[10], values[11]);
}

/// All groups stay, so that nothing has to be known of them.
void by_replacing() {
  std::string text;
  for (const char c : TEMPLATE) {
    if (std::string_view("[]{}").find(c) == std::string_view::npos) text += c;
  }
  for (std::size_t i = 0; i < NUM_KEYWORDS; ++i) {
    const std::string reference = std::string("$") + KEYWORDS[i];
    for (std::size_t at = text.find(reference); at != text.npos; at = text.find(reference, at)) {
      text.replace(at, reference.size(), values[i]);
    }
  }
  std::memcpy(expanded, text.data(), text.size());
}

void expand(std::string_view way, int times) {
  LA_KEYWORD_TABLE table;
  for (std::size_t i = 0; i < NUM_KEYWORDS; ++i) {
    table.set_keyword(KEYWORDS[i], VALUES[i]);
    values[i] = VALUES[i];
    asm volatile("" : : "r"(values) : "memory");
  }
  by_library(table);
  const std::string expected = expanded;
  require(expected.size() == 200, expanded);
  std::memset(expanded, 0, sizeof expanded);
  if (way == "library") measure(times, [&table] { by_library(table); });
  if (way == "compiled") measure(times, by_compiled_code);
  if (way == "snprintf") measure(times, by_snprintf);
  if (way == "replace") measure(times, by_replacing);
  require(expected == expanded, expanded);
}

}  // namespace

int main(int count, char** arguments) {
  require(count > 1, "host: what?");
  Port_MsgManData::setSink({count_message, nullptr, false});
  const std::string_view what = arguments[1];
  const words rest = arguments + 2;
  if (what == "plan") plan(rest);
  if (what == "load") load(rest);
  if (what == "spawn") spawn(rest);
  if (what == "output") output();
  if (what == "expand") expand(rest[0], std::atoi(rest[1]));
}
