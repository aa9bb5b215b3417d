// The library dumps the node that broke a tree to the host's message manager; whoever explains a
// refusal has a better text.
#ifndef BOOLEQ_BASE_MESSAGES_H
#define BOOLEQ_BASE_MESSAGES_H

#include <type_traits>
#include <utility>

#include <port/Port_MsgManData.h>

namespace booleq {

// Drops the host's messages while it lives, and then lets them go where they went before.
// A host whose message manager cannot be redirected keeps its own way.
template <class Manager, class = void>
class Silence {
};

template <class Manager>
class Silence<Manager, std::void_t<decltype(Manager::setSink(typename Manager::Sink()))>> {
  public:
    Silence()
        : m_sink(Manager::setSink([](const char*, const char*, int, const char*, const char*) {}))
    {
    }
    ~Silence() { Manager::setSink(std::move(m_sink)); }
    Silence(const Silence&) = delete;
    Silence& operator=(const Silence&) = delete;

  private:
    typename Manager::Sink m_sink;
};

typedef Silence<Port_MsgManData> NoMessages;

} // namespace booleq

#endif
