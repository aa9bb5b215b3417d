// Environment variables for programs of this host: their names start with TINY_.
#ifndef TINY_ENV_H
#define TINY_ENV_H

struct Port_Env {
    static const char* GetEnv(const char* name);
};

#endif
