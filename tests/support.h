// What all tests share: a recorder of messages, a tree of files, a fixed environment.
#ifndef KESTREL_TESTS_SUPPORT_H
#define KESTREL_TESTS_SUPPORT_H

#include <gtest/gtest.h>

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "host/port_msgman.h"

/// Sets or removes every environment variable that counts.
void fix_environment();

/// Records all messages while it lives.
class Messages {
 public:
  struct Record {
    Port_MsgLevel level;
    std::string origin;  ///< "file:line revision"
    std::string text;
  };

  Messages();
  Messages(const Messages&) = delete;
  Messages& operator=(const Messages&) = delete;
  ~Messages() { Port_MsgManData::setSink(before_); }

  /// All messages since the last call, each as its text behind "S ", "I ", "W ", "E " or "D ".
  std::string take();
  std::vector<Record> records;

 private:
  Port_MsgSink before_;
};

/// Sets an environment variable, or removes it for null, while it lives.
class Variable {
 public:
  Variable(const char* name, const char* value);
  Variable(const Variable&) = delete;
  Variable& operator=(const Variable&) = delete;
  ~Variable();

 private:
  std::string name_;
  std::optional<std::string> before_;
};

/// A new directory that is the current one while this lives, and an installation root in it:
/// share/data/. Both are removed at the end.
class Tree {
 public:
  Tree();
  Tree(const Tree&) = delete;
  Tree& operator=(const Tree&) = delete;
  ~Tree();

  /// Makes files from words like "d.edf", "a/d.edf@5": a path, and perhaps a time stamp of so many
  /// seconds after a fixed moment (without it: 0). Directories are made where they are missing; a
  /// path that ends with "/" is one.
  void make(const std::string& files);
  /// Writes a file, and the directories above it.
  void write(const std::string& path, const std::string& content);
  std::string read(const std::string& path) const;
  bool exists(const std::string& path) const;
  void remove(const std::string& path) const;
  /// The full name of a path in the tree.
  std::string full(const std::string& path) const { return home + "/" + path; }
  /// text with every "~" replaced by the tree's directory.
  std::string expand(std::string text) const;
  /// text with every occurrence of the tree's directory replaced by "~".
  std::string shorten(std::string text) const;
  /// Runs shell commands, with the command that is tested on PATH. Tells what they print,
  /// shortened.
  std::string shell(const std::string& commands) const;

  std::string home;

 private:
  std::string before_;
  std::optional<Variable> root_;
};

/// What a program did.
struct Ran {
  int status;
  std::string out;
  std::string err;
};

/// Runs a program in the current directory, with nothing on its standard input. meanwhile is called
/// with its number, which is also that of a process group.
Ran run(
    const std::vector<std::string>& words,
    const std::function<void(pid_t)>& meanwhile = [](pid_t) {});

/// The content of a file.
std::string slurp(const std::string& path);

/// text with every occurrence of from replaced by to.
std::string replaced(std::string text, const std::string& from, const std::string& to);

/// The rows of a table: its lines, cut into cells at " | ". Blanks around cells and empty lines do
/// not count.
std::vector<std::vector<std::string>> table(const std::string& text);

/// text with the characters that "\n", "\r", "\t" and "\0" in it stand for.
std::string unescape(const std::string& text);
/// Expects of each row of a table that f makes the second cell of the first one, both unescaped.
void expect_table(const std::function<std::string(const std::string&)>& f, const std::string& text);
/// Texts with a blank between them, "-" for null.
std::string shown(std::initializer_list<const char*> texts);

/// Programs of the build.
extern const char* const KESTREL_LAUNCH;
extern const char* const TEST_NETLISTER;

#endif
