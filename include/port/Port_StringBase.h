// The host tool chain's byte string, as the library's interface uses it.
// Default host library: a thin class over the standard string. Another host puts its own header of
// this name first on the include path; the library needs only the members declared here.
#ifndef PORT_STRINGBASE_H
#define PORT_STRINGBASE_H

#include <cstddef>
#include <string>

namespace Port {

template <class CharT>
class StringBase; // only for char

// A byte string of any length; it may contain bytes of value 0.
// A null 'const char*' counts as the empty text.  Fails: std::bad_alloc only.
// Threads: different strings are independent; const members of one string may run at once.
template <>
class StringBase<char> {
  public:
    StringBase() = default; // the empty text
    // The bytes before the first 0; implicit, so that a literal can be passed for a string.
    StringBase(const char* text) : m_text(text ? text : "") {}
    // Copies or takes the other's bytes; a string that was moved from may hold any text.
    StringBase(const StringBase& other) = default;
    StringBase(StringBase&& other) noexcept = default;
    ~StringBase() = default;
    StringBase& operator=(const StringBase& other) = default;
    StringBase& operator=(StringBase&& other) noexcept = default;
    // Takes the bytes before the first 0.
    StringBase& operator=(const char* text)
    {
        m_text = text ? text : "";
        return *this;
    }

    // Appends a text, the bytes before the first 0, or one byte; any may be part of this string.
    StringBase& operator+=(const StringBase& other)
    {
        m_text += other.m_text;
        return *this;
    }
    StringBase& operator+=(const char* text)
    {
        m_text += text ? text : "";
        return *this;
    }
    StringBase& operator+=(char character)
    {
        m_text += character;
        return *this;
    }

    // Makes room for a text of this many bytes. A host's class need not have it; where it exists,
    // long texts are written once instead of being moved each time they double.
    void reserve(std::size_t length) { m_text.reserve(length); }

    // Number of bytes, not counting a terminating 0.
    std::size_t length() const { return m_text.length(); }
    // The bytes, followed by a 0; valid until the string changes.
    const char* c_str() const { return m_text.c_str(); }

  private:
    std::string m_text;
};

} // namespace Port

#endif
