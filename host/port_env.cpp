#include "host/port_env.h"

#include <cstdlib>

const char* Port_Env::GetEnv(const char* name) {
  return std::getenv(name);
}
