// The host tool chain's view of the process environment.
#ifndef PORT_ENV_H
#define PORT_ENV_H

class Port_Env { // the process environment; no objects of it are needed
  public:
    // The value of the environment variable 'name', or null when it is unset (or 'name' is null).
    // The text belongs to the environment: it is valid until the variable is changed.
    // Threads: any, while none changes the environment.
    static const char* GetEnv(const char* name);
};

#endif
