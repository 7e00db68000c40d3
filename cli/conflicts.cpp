#include "cli/conflicts.h"

#include "cli/console.h"
#include "host/port_file.h"

conflicts::conflicts(LA_LAUNCHER& launcher) : launcher_(launcher) {
  launcher.ask_before_chains(may_build, this);
}

conflicts::~conflicts() {
  launcher_.ask_before_chains(nullptr, nullptr);
}

unsigned char conflicts::may_build(void* self, const char* const* files, int count) {
  auto& [launcher, name, origins] = *static_cast<conflicts*>(self);
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
  for (int i = 1; i < count; ++i) origins.insert({files[i], {files[i - 1], name}});
  return 1;
}
