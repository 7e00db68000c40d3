#include "cli/console.h"

#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <utility>

#include "host/utf8.h"

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

/// What is still to be written to standard error.
std::string waiting;
constexpr std::size_t BLOCK = 65536;

}  // namespace

console::console(bool debug)
    : is_terminal_(::isatty(STDERR_FILENO) != 0),
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
  waiting += text;
  if (waiting.size() >= BLOCK) flush();
}

void console::flush() {
  for (std::string_view rest = waiting; !rest.empty();) {
    const ssize_t written = ::write(STDERR_FILENO, rest.data(), rest.size());
    if (written >= 0) {
      rest.remove_prefix(static_cast<std::size_t>(written));
    } else if (errno == EAGAIN) {
      // Whoever else writes there may have asked not to wait.
      pollfd place = {STDERR_FILENO, POLLOUT, 0};
      ::poll(&place, 1, -1);
    } else if (errno != EINTR) {
      break;
    }
  }
  waiting.clear();
}

void console::show(void* self, const Port_Msg& message) {
  const auto& [is_terminal, colour, before] = *static_cast<console*>(self);
  const appearance look = appearance_of(message.level);
  const bool coloured = colour && *look.prefix != '\0';
  if (coloured) say(look.colour);
  say(look.prefix);
  if (coloured) say("\033[0m");
  const std::string_view text = message.text;
  say(text);
  if (!text.ends_with('\n')) say("\n");
  if (is_terminal) flush();
}

diversion::diversion(std::function<bool(const Port_Msg&)> take)
    : take_(std::move(take)), before_(Port_MsgManData::setSink({show, this, false})) {}

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
