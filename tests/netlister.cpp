// Plays every netlister of the tests. Its arguments, carried out in order:
//   say=TEXT    writes TEXT and a line end to standard output; err=TEXT to standard error
//   args        writes each argument of the call between brackets, on one line
//   dir         writes the current directory
//   out=FILE    writes FILE; its content is the arguments of the call
//   exit=N      ends with exit code N; kill=N ends by signal N
//   leave=N     leaves a process behind that holds the output open for N seconds
//   close       closes standard output and error
//   sleep=N     sleeps for N milliseconds
//   trap=N      ends with exit code 0 when signal N comes
//   defy=N      writes the file "defied" when signal N comes, and goes on
//   signals     writes which signals are blocked and which are ignored
// Any other argument does nothing.
#include <fcntl.h>
#include <signal.h>
#include <unistd.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>
#include <vector>

namespace {

std::string all(const std::vector<std::string>& words) {
  std::string text;
  for (const std::string& word : words) text += "[" + word + "]";
  return text + "\n";
}

void write_to(int descriptor, const std::string& text) {
  if (::write(descriptor, text.data(), text.size()) < 0) std::exit(99);
}

std::string signal_state() {
  std::ifstream status("/proc/self/status");
  std::string state;
  for (std::string line; std::getline(status, line);) {
    if (line.starts_with("SigBlk") || line.starts_with("SigIgn")) state += line + "\n";
  }
  return state;
}

void leave_behind(unsigned int seconds) {
  if (::fork() != 0) return;
  ::sleep(seconds);
  ::_exit(0);
}

void carry_out(const std::string& verb, const std::string& value,
               const std::vector<std::string>& words) {
  const int number = std::atoi(value.c_str());
  if (verb == "say") write_to(1, value + "\n");
  if (verb == "err") write_to(2, value + "\n");
  if (verb == "args") write_to(1, all(words));
  if (verb == "dir") write_to(1, std::filesystem::current_path().string() + "\n");
  if (verb == "out") std::ofstream(value) << all(words);
  if (verb == "exit") std::exit(number);
  if (verb == "kill") ::raise(number);
  if (verb == "leave") leave_behind(static_cast<unsigned int>(number));
  if (verb == "trap") ::signal(number, [](int) { ::_exit(0); });
  if (verb == "defy") ::signal(number, [](int) { ::close(::creat("defied", 0600)); });
  if (verb == "signals") write_to(1, signal_state());
  if (verb == "close") ::close(1), ::close(2);
  if (verb == "sleep") std::this_thread::sleep_for(std::chrono::milliseconds(number));
}

}  // namespace

int main(int count, char** arguments) {
  const std::vector<std::string> words(arguments + 1, arguments + count);
  for (const std::string& word : words) {
    const std::size_t equals = word.find('=');
    const bool has_value = equals != word.npos;
    carry_out(word.substr(0, equals), has_value ? word.substr(equals + 1) : "", words);
  }
}
