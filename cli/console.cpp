#include "cli/console.h"

#include <poll.h>
#include <unistd.h>

#include <array>
#include <atomic>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <new>
#include <utility>

#include "host/base/utf8.h"

namespace {

struct appearance {
  const char* prefix;
  const char* colour;
};

constexpr appearance appearance_of(Port_MsgLevel level) {
  switch (level) {
    case PORT_MSG_INFO:
      return {"INFO: ", "\033[36m"};
    case PORT_MSG_WARNING:
      return {"WARNING: ", "\033[33m"};
    case PORT_MSG_ERROR:
      return {"ERROR: ", "\033[31m"};
    case PORT_MSG_DEBUG:
      return {"DEBUG: ", "\033[2m"};
    default:
      return {"", ""};
  }
}

constexpr const char* OURSELVES = "kestrel-launch";

std::array<int, PORT_MSG_DEBUG + 1> counts = {};

/// What is still to be written, and where. Only one text waits at a time: so all come in order.
std::string waiting;
int descriptor = STDERR_FILENO;
constexpr std::size_t BLOCK = 65536;

/// Whether texts for a descriptor are dropped.
bool is_lost[STDERR_FILENO + 1] = {};

std::atomic<int> hurries = 0;
static_assert(std::atomic<int>::is_always_lock_free);

/// Returns whether all of the text is written.
bool write_all(std::string_view text) {
  const int hurries_before = hurries;
  while (!text.empty() && hurries - hurries_before < 2) {
    const ssize_t written = ::write(descriptor, text.data(), text.size());
    if (written >= 0) {
      text.remove_prefix(static_cast<std::size_t>(written));
    } else if (errno == EAGAIN) {
      // Whoever else writes there may have asked not to wait.
      pollfd event = {descriptor, POLLOUT, 0};
      ::poll(&event, 1, -1);
    } else if (errno != EINTR) {
      return false;
    }
  }
  return text.empty();
}

void add(int its_descriptor, std::string_view text) {
  if (descriptor != its_descriptor) console::flush();
  descriptor = its_descriptor;
  try {
    waiting += text;
  } catch (const std::bad_alloc&) {
    console::flush();
    write_all(text);
  }
  if (waiting.size() >= BLOCK) console::flush();
}

}  // namespace

console::console(bool debug)
    : is_terminal_(is_terminal()),
      colour_(is_terminal_ && std::getenv("NO_COLOR") == nullptr),
      before_(Port_MsgManData::setSink({show, this, debug})) {
  Port_MsgManData::setFlush([](void* /*context*/) { flush(); }, nullptr);
}

console::~console() {
  Port_MsgManData::setFlush(nullptr, nullptr);
  Port_MsgManData::setSink(before_);
  flush();
}

void console::say(std::string_view text) {
  add(STDERR_FILENO, text);
}

void console::print(std::string_view text) {
  add(STDOUT_FILENO, text);
}

void console::flush() {
  if (!is_lost[descriptor] && !write_all(waiting)) {
    // There may be room for later messages. Results are complete up to a point.
    is_lost[descriptor] = descriptor == STDOUT_FILENO || hurries != 0;
  }
  waiting.clear();
}

void console::hurry() {
  ++hurries;
}

bool console::has_lost_results() {
  return is_lost[STDOUT_FILENO];
}

int console::count(Port_MsgLevel level) {
  return counts[level];
}

bool console::is_terminal() {
  static const bool is_terminal = ::isatty(STDERR_FILENO) != 0;
  return is_terminal;
}

void console::show(void* self, const Port_Msg& message) {
  const auto& [flushes, colour, before] = *static_cast<console*>(self);
  ++counts[message.level];
  if (message.program == OURSELVES) {
    complain(std::string(message.text, std::strlen(message.text) - 1));
    return;
  }
  const appearance look = appearance_of(message.level);
  const bool coloured = colour && *look.prefix != '\0';
  if (coloured) say(look.colour);
  say(look.prefix);
  if (coloured) say("\033[0m");
  const std::string_view text = message.text;
  say(text);
  if (!text.ends_with('\n')) say("\n");
  if (flushes) flush();
}

diversion::diversion(std::function<bool(const Port_Msg&)> take)
    : take_(std::move(take)), before_(Port_MsgManData::setSink({show, this, false})) {
  Port_MsgManData::setSink({show, this, before_.debug});
}

diversion::~diversion() {
  Port_MsgManData::setSink(before_);
}

void diversion::show(void* self, const Port_Msg& message) {
  const auto& [take, before] = *static_cast<diversion*>(self);
  if (!take(message)) before.function(before.context, message);
}

void complain(const std::string& text) {
  complain(std::vector{text});
}

void complain(const std::vector<std::string>& texts) {
  for (const std::string& text : texts) console::say("kestrel-launch: " + text + "\n");
  console::flush();
}

void complain(Port_MsgLevel level, const std::string& text) {
  Port_MsgManData& message =
      Port_MsgManData::createObject(OURSELVES, "cli/console.cpp", __LINE__, "");
  const auto issue =
      level == PORT_MSG_ERROR ? &Port_MsgManData::issueError : &Port_MsgManData::issueWarning;
  (message.*issue)("%s\n", text.c_str());
}

std::string json_string(std::string_view text) {
  std::string quoted = "\"";
  while (!text.empty()) {
    const utf8_character c = first_character(text);
    char escape[8];
    if (!c.valid || c.code < 0x20 || c.code == 0x7F) {
      const unsigned int code =
          c.valid ? c.code : 0xDC00 + static_cast<unsigned char>(text.front());
      std::snprintf(escape, sizeof escape, "\\u%04x", code);
      quoted += escape;
    } else {
      if (c.code == '"' || c.code == '\\') quoted += '\\';
      quoted += text.substr(0, c.bytes);
    }
    text.remove_prefix(c.bytes);
  }
  return quoted + "\"";
}
