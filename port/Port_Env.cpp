// The process environment of the default host: the C library's.
#include <port/Port_Env.h>

#include <cstdlib>

const char* Port_Env::GetEnv(const char* name)
{
    return name ? std::getenv(name) : nullptr;
}
