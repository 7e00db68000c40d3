// Runs a program as a child process.
#ifndef KESTREL_HOST_SYSTEM_CHILD_H
#define KESTREL_HOST_SYSTEM_CHILD_H

#include <cstddef>
#include <functional>
#include <string>
#include <vector>

/// What became of a child.
struct la_child_end {
  std::string failure;  ///< why it could not be started, or not be followed to its end; or empty
  int exit_code = 0;    ///< 128 + N when signal N ended it
};

/// Gets a block of what a child writes to its standard output and error, behind which there is room
/// for one character more; in the end one of no length.
using la_take_output = std::function<void(char* block, std::size_t length)>;

/// The largest block.
constexpr std::size_t LA_OUTPUT_BLOCK = 65536;

/// Starts the program words[0] with the arguments that follow it, and returns when it has ended.
/// It writes to where this process does when take is empty. Sets was_started as soon as it runs;
/// whatever happens then, and if take throws, it has been reaped at the end.
la_child_end la_run_child(std::vector<std::string>& words, const la_take_output& take,
                          bool& was_started);

#endif
