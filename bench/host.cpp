// A host program of the library, for the workloads that are measured inside a process.
//
//   find MEGABYTES TIMES force|decide DIRECTORY...   resolves "top" over and over in a big process
//   load [FILE]                                      loads the rules
//   expand WAY TIMES                                 expands a template, by the library or
//   otherwise
#include <string>
#include <string_view>

#include "bench/measure.h"
#include "host/port_msgman.h"
#include "launcher/baslauncher.h"
#include "optparse/baslaoptparse.h"

namespace {

using words = char**;

/// Drops messages, but for errors.
void show_error(void* /*context*/, const Port_Msg& message) {
  if (message.level == PORT_MSG_ERROR) std::fputs(message.text, stderr);
}

/// A launcher without part, libraries and switches.
struct plain_launcher : LA_LAUNCHER {
  plain_launcher(std::vector<const char*> dirs, const char* rules, bool force)
      : LA_LAUNCHER(nullptr, dirs.data(), static_cast<short>(dirs.size()), nullptr, 0, "out", rules,
                    force, 0, 0, 0, 0, 0) {
    require(ok, "the rules are not valid");
  }
};

void find(words rest, std::size_t count) {
  grow(std::atoi(rest[0]));
  plain_launcher launcher({rest + 3, rest + count}, nullptr, std::string_view(rest[2]) == "force");
  measure(std::atoi(rest[1]), [&launcher] {
    char source[LA_MAX_PATH];
    char netlist[LA_MAX_PATH];
    launcher.find("top", source, netlist, 1);
  });
  require(launcher.errors == 0, "there were errors");
}

/// The rules stay until the process ends: what their end costs is not measured.
void load(words rest) {
  alignas(plain_launcher) static char launcher[sizeof(plain_launcher)];
  measure(1, [&] { new (launcher) plain_launcher({}, *rest, false); });
}

// ---- Templates ----

constexpr char TEMPLATE[] =
    "-p $part [-family $family] [-dev $device] [-pkg $pkg] [-speed $speed] {-l $libraries }"
    "[$ignore_locs] [$add_pads] [$quiet] [$aul] '-dir=$OUTPUT' -o $outfile -i $infile";
/// Each followed by its value.
constexpr const char* KEYWORDS[] = {"part",        "hx8k-ct256-10",
                                    "family",      "ice40",
                                    "device",      "hx8k",
                                    "pkg",         "ct256",
                                    "speed",       "10",
                                    "OUTPUT",      "/home/user/work/projects/board-rev/out/",
                                    "ignore_locs", "-r",
                                    "add_pads",    "-a",
                                    "quiet",       "-quiet",
                                    "aul",         "-aul",
                                    "outfile",     "\"../out/receiver.kbo\"",
                                    "infile",      "\"receiver.blif\"",
                                    "libraries",   "/home/user/libraries/cells"};
constexpr std::size_t NUM_KEYWORDS = std::size(KEYWORDS) / 2;

/// The values as the ways to expand get them: the compiler knows nothing of them.
const char* values[NUM_KEYWORDS];
char expanded[LA_MAX_PATH];

void by_library(const LA_KEYWORD_TABLE& table) {
  table.expand(TEMPLATE, expanded, LA_MAX_PATH);
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
  std::string text = TEMPLATE;
  std::erase_if(text, [](char c) { return std::strchr("[]{}", c) != nullptr; });
  for (std::size_t i = 0; i < NUM_KEYWORDS; ++i) {
    const std::string reference = std::string("$") + KEYWORDS[2 * i];
    for (std::size_t at = text.find(reference); at != text.npos; at = text.find(reference, at)) {
      text.replace(at, reference.size(), values[i]);
    }
  }
  std::memcpy(expanded, text.c_str(), text.size() + 1);
}

void expand(std::string_view way, int times) {
  LA_KEYWORD_TABLE table;
  for (std::size_t i = 0; i < NUM_KEYWORDS; ++i) {
    table.set_keyword(KEYWORDS[2 * i], KEYWORDS[2 * i + 1]);
    values[i] = KEYWORDS[2 * i + 1];
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
  Port_MsgManData::setSink({show_error, nullptr, false});
  const std::string_view what = arguments[1];
  words rest = arguments + 2;
  if (what == "find") find(rest, static_cast<std::size_t>(count) - 2);
  if (what == "load") load(rest);
  if (what == "expand") expand(rest[0], std::atoi(rest[1]));
}
