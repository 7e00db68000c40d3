// Plays every netlister of the tests. Its arguments, carried out in order:
//   say=TEXT    writes TEXT and a line end to standard output; err=TEXT to standard error
//   args        writes each argument of the call between brackets, on one line
//   dir         writes the current directory
//   out=FILE    writes FILE; its content is the arguments of the call
//   exit=N      ends with exit code N; kill=N ends by signal N
//   close       closes standard output and error
//   sleep=N     sleeps for N milliseconds
// Any other argument does nothing.
#include <signal.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>
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
  if (verb == "close") ::close(1), ::close(2);
  if (verb == "sleep") ::usleep(static_cast<useconds_t>(number) * 1000);
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
