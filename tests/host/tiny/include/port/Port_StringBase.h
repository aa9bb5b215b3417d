// A byte string with its own buffer and only the operations of the platform interface.
#ifndef TINY_STRINGBASE_H
#define TINY_STRINGBASE_H

#include <cstddef>
#include <cstring>

namespace Port {

template <class CharT>
class StringBase;

template <>
class StringBase<char> {
  public:
    StringBase() : m_bytes(nullptr), m_length(0) {}
    StringBase(const char* text) : m_bytes(nullptr), m_length(0) { Append(text, Length(text)); }
    StringBase(const StringBase& other) : m_bytes(nullptr), m_length(0)
    {
        Append(other.m_bytes, other.m_length);
    }
    ~StringBase() { delete[] m_bytes; }

    StringBase& operator=(const StringBase& other)
    {
        StringBase copy(other);
        Swap(copy);
        return *this;
    }
    StringBase& operator=(const char* text)
    {
        StringBase copy(text);
        Swap(copy);
        return *this;
    }

    StringBase& operator+=(const StringBase& other)
    {
        Append(other.m_bytes, other.m_length);
        return *this;
    }
    StringBase& operator+=(const char* text)
    {
        Append(text, Length(text));
        return *this;
    }
    StringBase& operator+=(char character)
    {
        Append(&character, 1);
        return *this;
    }

    std::size_t length() const { return m_length; }
    const char* c_str() const { return m_bytes ? m_bytes : ""; }

  private:
    static std::size_t Length(const char* text) { return text ? std::strlen(text) : 0; }

    // The buffer has exactly the size of the text; null stands for the empty text.
    void Append(const char* bytes, std::size_t length)
    {
        if (length == 0)
            return;
        char* longer = new char[m_length + length + 1];
        if (m_length)
            std::memcpy(longer, m_bytes, m_length);
        std::memcpy(longer + m_length, bytes, length);
        longer[m_length + length] = '\0';
        delete[] m_bytes;
        m_bytes = longer;
        m_length += length;
    }
    void Swap(StringBase& other)
    {
        char* const bytes = m_bytes;
        const std::size_t length = m_length;
        m_bytes = other.m_bytes;
        m_length = other.m_length;
        other.m_bytes = bytes;
        other.m_length = length;
    }

    char* m_bytes;
    std::size_t m_length;
};

} // namespace Port

#endif
