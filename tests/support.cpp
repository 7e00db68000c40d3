#include "support.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>

namespace fs = std::filesystem;

const char* const KESTREL_LAUNCH = KESTREL_BIN_DIR "/kestrel-launch";
const char* const TEST_NETLISTER = KESTREL_BIN_DIR "/test-netlister";

namespace {

void record(void* self, const Port_Msg& m) {
  std::string origin;
  if (m.file != nullptr) {
    origin = std::string(m.file) + ":" + std::to_string(m.line) + " " + m.revision;
    EXPECT_STREQ(m.program, "Kestrel");
  }
  static_cast<Messages*>(self)->records.push_back({m.level, origin, m.text});
}

}  // namespace

std::string slurp(const std::string& path) {
  std::ifstream in(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(in), {}};
}

std::string replaced(std::string text, const std::string& from, const std::string& to) {
  for (std::size_t at = text.find(from); at != text.npos; at = text.find(from, at + to.size())) {
    text.replace(at, from.size(), to);
  }
  return text;
}

Messages::Messages() : before_(Port_MsgManData::setSink({record, this, true})) {}

std::string Messages::take() {
  std::string all;
  for (const Record& r : records) all += std::string(1, "SIWED"[r.level]) + " " + r.text;
  records.clear();
  return all;
}

Variable::Variable(const char* name, const char* value) : name_(name) {
  if (const char* old = std::getenv(name)) before_ = old;
  value != nullptr ? ::setenv(name, value, 1) : ::unsetenv(name);
}

Variable::~Variable() {
  before_ ? ::setenv(name_.c_str(), before_->c_str(), 1) : ::unsetenv(name_.c_str());
}

Tree::Tree() : before_(fs::current_path()) {
  std::string name = fs::temp_directory_path() / "kestrel-XXXXXX";
  home = fs::canonical(::mkdtemp(name.data()));
  fs::current_path(home);
  fs::create_directories(full("share/data"));
  root_.emplace("CORVANE", full("share").c_str());
}

Tree::~Tree() {
  fs::current_path(before_);
  fs::remove_all(home);
}

void Tree::make(const std::string& files) {
  std::istringstream words(files);
  for (std::string word; words >> word;) {
    const std::size_t at = std::min(word.find('@'), word.size());
    const std::string path = word.substr(0, at);
    if (path.ends_with('/')) {
      fs::create_directories(full(path));
      continue;
    }
    if (!exists(path)) write(path, path + "\n");
    const time_t age = at < word.size() ? std::stol(word.substr(at + 1)) : 0;
    const timespec times[2] = {{1'700'000'000 + age, 0}, {1'700'000'000 + age, 0}};
    ASSERT_EQ(::utimensat(AT_FDCWD, full(path).c_str(), times, 0), 0) << path;
  }
}

void Tree::write(const std::string& path, const std::string& content) {
  fs::create_directories(fs::path(full(path)).parent_path());
  std::ofstream(full(path), std::ios::binary) << content;
}

std::string Tree::read(const std::string& path) const {
  return slurp(full(path));
}

bool Tree::exists(const std::string& path) const {
  return fs::exists(full(path));
}

void Tree::remove(const std::string& path) const {
  fs::remove_all(full(path));
}

std::string Tree::expand(std::string text) const {
  return replaced(std::move(text), "~", home);
}

std::string Tree::shorten(std::string text) const {
  return replaced(std::move(text), home, "~");
}

std::string Tree::shell(const std::string& commands) const {
  return shorten(run({"sh", "-c", "exec 2>&1; PATH=" KESTREL_BIN_DIR ":$PATH;" + commands}).out);
}

Ran run(const std::vector<std::string>& words, const std::function<void(pid_t)>& meanwhile) {
  std::string base = fs::temp_directory_path() / "kestrel-run-XXXXXX";
  ::mkdtemp(base.data());
  const pid_t child = ::fork();
  if (child == 0) {
    ::setpgid(0, 0);
    ::dup2(::open("/dev/null", O_RDONLY), 0);
    ::dup2(::open((base + "/out").c_str(), O_CREAT | O_WRONLY, 0600), 1);
    ::dup2(::open((base + "/err").c_str(), O_CREAT | O_WRONLY, 0600), 2);
    std::vector<char*> arguments;
    arguments.reserve(words.size() + 1);
    for (const std::string& word : words) arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    ::execvp(arguments[0], arguments.data());
    ::_exit(127);
  }
  meanwhile(child);
  int status = 0;
  ::waitpid(child, &status, 0);
  Ran ran = {WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status), slurp(base + "/out"),
             slurp(base + "/err")};
  fs::remove_all(base);
  return ran;
}

std::vector<std::vector<std::string>> table(const std::string& text) {
  std::vector<std::vector<std::string>> rows;
  std::istringstream lines(text);
  for (std::string line; std::getline(lines, line);) {
    if (line.empty()) continue;
    rows.emplace_back();
    line.insert(0, " ").append("  | ");
    for (std::size_t at = 0; (at = line.find(" | ")) != line.npos; line.erase(0, at + 3)) {
      const std::size_t start = std::min(line.find_first_not_of(' '), at);
      const std::size_t end = line.find_last_not_of(' ', at) + 1;
      rows.back().push_back(line.substr(start, std::max(end, start) - start));
    }
  }
  return rows;
}

std::string unescape(const std::string& text) {
  const std::string lines = replaced(replaced(text, "\\n", "\n"), "\\r", "\r");
  return replaced(replaced(lines, "\\t", "\t"), "\\0", std::string(1, '\0'));
}

void expect_table(const std::function<std::string(const std::string&)>& f,
                  const std::string& text) {
  for (const auto& row : table(text)) {
    EXPECT_EQ(f(unescape(row[0])), row.size() > 1 ? unescape(row[1]) : "") << row[0];
  }
}

std::string shown(std::initializer_list<const char*> texts) {
  std::string all;
  for (const char* text : texts) all += std::string(" ") + (text != nullptr ? text : "-");
  return all.substr(1);
}

void fix_environment() {
  for (const char* name : {"LAUNCHER_DETAIL", "LA_DISABLE", "LA_TEST", "MYCORVANE", "CORVANE",
                           "CVN_KESTREL_ALLOW_PLF", "NO_COLOR"}) {
    ::unsetenv(name);
  }
  ::setenv("LC_ALL", "C", 1);
  ::setenv("TZ", "UTC", 1);
  ::setenv("PATH", "/usr/bin:/bin", 1);
}
