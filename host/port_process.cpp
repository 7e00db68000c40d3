#include "host/port_process.h"

#include <new>

#include "host/base/line_cutter.h"
#include "host/base/utf8.h"
#include "host/port_interrupt.h"
#include "host/system/child.h"

bool Port_Process::fail(const std::string& program, const std::string& reason) {
  error_ = from_utf8(program) + L": " + from_utf8(reason);
  return false;
}

/// Returns whether the program was started and has ended.
bool Port_Process::run(const std::string& command, bool& was_started) {
  std::vector<std::string> words;
  if (!Split(command, words)) return fail(command, "a quote is without its partner");
  // The program's name ends at the first blank: one that is missing is not made up for by the
  // argument that follows.
  if (words.empty() || words[0].empty() || command[0] == ' ' || command[0] == '\t') {
    return fail("\"\"", "the name of the program is empty");
  }
  if (Port_Interrupt::Requested() != 0) return fail(words[0], "interrupted");

  static_assert(la_line_cutter::LONGEST >= LA_OUTPUT_BLOCK);
  la_line_cutter lines([this](const char* line) { Output(line); });
  la_take_output take;
  if (mode_ == 2) {
    take = [this, &lines](char* block, std::size_t length) {
      length > 0 ? lines.add(block, length) : lines.flush();
      Pause();
    };
  }
  Pause();
  const la_child_end end = la_run_child(words, take, was_started);
  exit_code_ = end.exit_code;
  return end.failure.empty() || fail(words[0], end.failure);
}

Port_Process::PROCESS_STATUS Port_Process::Run(const char* command) {
  bool was_started = false;
  try {
    if (run(command, was_started)) return PROCESS_ENDED;
  } catch (const std::bad_alloc&) {
    error_.clear();
  }
  return was_started ? PROCESS_LOST : PROCESS_FAILED;
}

wchar_t* Port_Process::GetProcessErrmsg() const {
  static wchar_t no_memory[] = L"memory has run out";
  return error_.empty() ? no_memory : const_cast<wchar_t*>(error_.c_str());
}
