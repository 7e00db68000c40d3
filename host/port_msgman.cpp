#include "host/port_msgman.h"

#include <cstdio>
#include <new>
#include <string>
#include <string_view>

#include "host/cvnform.h"

namespace {

void write_to_stderr(void* /*context*/, const Port_Msg& message) {
  static constexpr const char* PREFIXES[] = {"", "INFO: ", "WARNING: ", "ERROR: ", "DEBUG: "};
  const bool has_end = std::string_view(message.text).ends_with('\n');
  std::fprintf(stderr, "%s%s%s", PREFIXES[message.level], message.text, has_end ? "" : "\n");
}

constexpr Port_MsgSink START_SINK = {write_to_stderr, nullptr, false};

Port_MsgSink& sink() {
  static Port_MsgSink current = START_SINK;
  return current;
}

struct {
  void (*function)(void* context);
  void* context;
} flush_of_sink = {nullptr, nullptr};

}  // namespace

Port_MsgSink Port_MsgManData::setSink(const Port_MsgSink& new_sink) {
  const Port_MsgSink old = sink();
  sink() = new_sink.function != nullptr ? new_sink : START_SINK;
  return old;
}

void Port_MsgManData::setFlush(void (*flush)(void* context), void* context) {
  flush_of_sink = {flush, context};
}

void Port_MsgManData::flush() {
  if (flush_of_sink.function != nullptr) flush_of_sink.function(flush_of_sink.context);
}

Port_MsgManData& Port_MsgManData::createObject(const char* program, const char* file, int line,
                                               const char* revision) {
  static Port_MsgManData manager;
  manager.program_ = program;
  manager.file_ = file;
  manager.line_ = line;
  manager.revision_ = revision;
  return manager;
}

void Port_MsgManData::issue(Port_MsgLevel level, const char* format, va_list arguments) const {
  std::string text;
  const char* shown = format;  // Without memory, that says more than nothing.
  try {
    text = format_text(format, arguments);
    shown = text.c_str();
  } catch (const std::bad_alloc&) {
  }
  hand_on(level, shown);
}

void Port_MsgManData::hand_on(Port_MsgLevel level, const char* text) const {
  const Port_MsgSink current = sink();
  current.function(current.context, {level, program_, file_, line_, revision_, text});
}

void Port_MsgManData::issueStatusText(const char* text) {
  hand_on(PORT_MSG_STATUS, text);
}

void Port_MsgManData::issueStatus(const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  issue(PORT_MSG_STATUS, format, arguments);
  va_end(arguments);
}

void Port_MsgManData::issueInfo(const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  issue(PORT_MSG_INFO, format, arguments);
  va_end(arguments);
}

void Port_MsgManData::issueWarning(const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  issue(PORT_MSG_WARNING, format, arguments);
  va_end(arguments);
}

void Port_MsgManData::issueError(const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  issue(PORT_MSG_ERROR, format, arguments);
  va_end(arguments);
}

void Port_MsgManData::debugStub(const char* format, ...) {
  if (!sink().debug) return;
  va_list arguments;
  va_start(arguments, format);
  Port_MsgManData().issue(PORT_MSG_DEBUG, format, arguments);
  va_end(arguments);
}
