#include "cli/conflicts.h"

#include <algorithm>

#include "cli/console.h"
#include "host/port_file.h"
#include "host/ut_str.h"

namespace {

/// What the outputs for a name are called, without extension and case.
std::string stem_of(const std::string& name) {
  std::string stem = name.substr(name.find_last_of("/\\") + 1);
  stem.resize(std::min(stem.rfind('.'), stem.size()));
  UT_STR::Lower(stem.data());
  return stem;
}

}  // namespace

conflicts::conflicts(LA_LAUNCHER& launcher, const std::vector<std::string>& names)
    : launcher_(launcher) {
  if (names.size() < 2) return;
  for (const std::string& name : names) ++stems_[stem_of(name)];
}

void conflicts::begin(const std::string& name) {
  name_ = name;
  // Few names have the stem of another one: the chains of all others need not be asked about.
  const bool may_meet = !stems_.empty() && stems_[stem_of(name)] > 1;
  launcher_.ask_before_chains(may_meet ? may_build : nullptr, this);
}

conflicts::~conflicts() {
  launcher_.ask_before_chains(nullptr, nullptr);
}

unsigned char conflicts::may_build(void* self, const char* const* files, int count) {
  auto& [launcher, stems, name, planned, origins] = *static_cast<conflicts*>(self);
  for (int i = 1; i < count; ++i) {
    const char* input = files[i - 1];
    const auto known = origins.find(files[i]);
    if (known == origins.end() || known->second.input == input ||
        Port::File::same(known->second.input.c_str(), input)) {
      continue;
    }
    complain(PORT_MSG_ERROR, std::string(files[i]) + " would be made from " + input + ", but " +
                                 known->second.name + " has it made from " + known->second.input);
    return 0;
  }
  for (int i = 1; i < count; ++i) planned.insert({files[i], {files[i - 1], name}});
  return 1;
}

void conflicts::end(bool is_found) {
  const std::vector<LA_RUN>& runs = launcher_.last_runs();
  for (const auto& [file, from] : planned_) {
    const bool ran = std::any_of(runs.begin(), runs.end(), [&output = file](const LA_RUN& run) {
      return run.output == output;
    });
    if (is_found || ran) origins_.insert({file, from});
  }
  planned_.clear();
}
