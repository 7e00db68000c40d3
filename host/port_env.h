// The environment of the process.
#ifndef KESTREL_HOST_PORT_ENV_H
#define KESTREL_HOST_PORT_ENV_H

/// Read access to it.
class Port_Env {
 public:
  /// The value of the environment variable, or null when it is not set. The text belongs to the
  /// environment and is good until that is changed.
  static const char* GetEnv(const char* name);
};

#endif
