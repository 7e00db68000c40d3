#include "cli/console.h"

#include <unistd.h>

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

}  // namespace

console::console(bool debug)
    : is_terminal_(::isatty(STDERR_FILENO) != 0),
      colour_(is_terminal_ && std::getenv("NO_COLOR") == nullptr),
      before_(Port_MsgManData::setSink({show, this, debug})) {
  static char buffer[65536];
  std::setvbuf(stderr, buffer, is_terminal_ ? _IOLBF : _IOFBF, sizeof buffer);
  Port_MsgManData::setFlush([](void* /*context*/) { flush(); }, nullptr);
}

console::~console() {
  Port_MsgManData::setFlush(nullptr, nullptr);
  Port_MsgManData::setSink(before_);
  flush();
}

void console::flush() {
  std::fflush(stderr);
}

void console::show(void* self, const Port_Msg& message) {
  const appearance look = appearance_of(message.level);
  const bool coloured = static_cast<console*>(self)->colour_ && *look.prefix != '\0';
  if (coloured) std::fputs(look.colour, stderr);
  std::fputs(look.prefix, stderr);
  if (coloured) std::fputs("\033[0m", stderr);
  const std::string_view text = message.text;
  std::fwrite(text.data(), 1, text.size(), stderr);
  if (!text.ends_with('\n')) std::fputc('\n', stderr);
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
  for (const std::string& text : texts) std::fprintf(stderr, "kestrel-launch: %s\n", text.c_str());
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
