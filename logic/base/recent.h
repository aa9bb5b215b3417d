// Keeps the values of recently used keys, for work that often meets the same ones again.
// In: a key and how to make its value. Out: the value, made once.
// Fails: as making the value does; nothing is kept then.
// Cost: a look-up; memory for kMaxKept values, all of which are dropped when one more comes.
#ifndef BOOLEQ_BASE_RECENT_H
#define BOOLEQ_BASE_RECENT_H

#include <cassert>
#include <cstddef>
#include <map>
#include <utility>

namespace booleq {

// Threads: one at a time.
template <class Key, class Value>
class Recent {
  public:
    static constexpr size_t kMaxKept = 64;

    // The reference is valid until the next call.
    template <class Make>
    const Value& Get(const Key& key, const Make& make)
    {
        const auto found = m_values.find(key);
        if (found != m_values.end())
            return found->second;
        Value value = make(key);
        if (m_values.size() >= kMaxKept)
            m_values.clear();
        assert(m_values.size() < kMaxKept);
        return m_values.emplace(key, std::move(value)).first->second;
    }

  private:
    std::map<Key, Value> m_values;
};

} // namespace booleq

#endif
