// Values of a JSON text as the netlist reader needs them.
// Fails: simdjson's own exceptions.
#ifndef BOOLEQ_DESIGN_JSON_VALUES_H
#define BOOLEQ_DESIGN_JSON_VALUES_H

#include <string_view>
#include <unordered_map>
#include <vector>

#include <simdjson.h>

#include "module_content.h"

namespace booleq {

namespace json = simdjson::ondemand;

// The local nets of a module by their numbers in the file. The numbers are usually dense, but need
// not be.
class BitNumbers {
  public:
    explicit BitNumbers(size_t numBytes) : m_max_dense(numBytes / 8) {}

    void Clear()
    {
        m_dense.clear();
        m_sparse.clear();
    }

    // The element of a bit, initially 0; the reference is valid until the next call.
    LocalNet& At(uint64_t bit)
    {
        if (bit >= m_max_dense)
            return m_sparse[bit];
        if (bit >= m_dense.size())
            m_dense.resize(static_cast<size_t>(bit + bit / 2 + 64), 0);
        return m_dense[static_cast<size_t>(bit)];
    }

  private:
    uint64_t m_max_dense;
    std::vector<LocalNet> m_dense;
    std::unordered_map<uint64_t, LocalNet> m_sparse;
};

// The text of a string without escapes, in place in the file, so that it need not be copied. Null
// data: the string has escapes. Without escapes, the first quotation mark ends it.
inline std::string_view Plain(json::raw_json_string raw)
{
    const char* start = raw.raw();
    const char* end = start;
    while (*end != '"' && *end != '\\')
        ++end;
    return *end == '"' ? std::string_view(start, static_cast<size_t>(end - start))
                       : std::string_view();
}

inline std::string_view KeyOf(simdjson::simdjson_result<json::field>& field)
{
    const std::string_view plain = Plain(field.key());
    return plain.data() != nullptr ? plain : std::string_view(field.unescaped_key());
}

inline std::string_view StringOf(json::value value)
{
    const std::string_view plain = Plain(value.get_raw_json_string());
    return plain.data() != nullptr ? plain : std::string_view(value.get_string());
}

// Fails: false if the value is not a string.
inline bool GetString(json::value value, std::string_view& text)
{
    if (value.type() != json::json_type::string)
        return false;
    text = StringOf(value);
    return true;
}

// Whether a flag is set: a number other than 0, or binary digits with a 1.
inline bool IsSet(json::value value)
{
    if (value.type() == json::json_type::string)
        return StringOf(value).find('1') != std::string_view::npos;
    return value.type() == json::json_type::number && double(value.get_double()) != 0;
}

// A value that is not a string, as written in the file.
inline std::string_view Token(json::value value)
{
    const std::string_view token = value.raw_json_token();
    return token.substr(0, token.find_last_not_of(" \t\r\n") + 1);
}

inline PortDirection DirectionOf(std::string_view word)
{
    return word == "input"    ? PortDirection::Input
           : word == "output" ? PortDirection::Output
                              : PortDirection::Both;
}

} // namespace booleq

#endif
