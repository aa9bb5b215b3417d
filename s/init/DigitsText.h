// Words of a column in, digits of an init value out, the highest row first.
#ifndef KQ_DIGITSTEXT_H
#define KQ_DIGITSTEXT_H

#include <cstddef>
#include <cstdint>
#include <type_traits>
#include <utility>

#include <port/Port_StringBase.h>

// Rows to a digit.
enum KQ_BASE : unsigned int { KQ_BINARY = 1, KQ_HEXADECIMAL = 4 };

// Whether a string class can make room ahead. The host interface does not require it; where it
// exists, a long text is written once instead of being moved each time it doubles.
template <class String, class = void>
struct KqHasReserve : std::false_type {
};
template <class String>
struct KqHasReserve<String, std::void_t<decltype(std::declval<String&>().reserve(size_t()))>>
    : std::true_type {
};

template <class String>
void KqReserve(String& text, size_t length)
{
    if constexpr (KqHasReserve<String>::value)
        text.reserve(length);
    else
        (void)text, (void)length;
}

// Appends the digits of columns to one text. 'upperCase' is for the hexadecimal digits from 10 on.
class KqDigitsText {
  public:
    typedef Port::StringBase<char> String;

    KqDigitsText(KQ_BASE base, bool upperCase, String& text)
        : m_base(base), m_upper_case(upperCase), m_text(text)
    {
    }

    // The column of 1 to 6 variables.
    void AppendFewRows(uint64_t word, unsigned int numVariables);

    // Makes room for the digits of this many words, if the host's string can.
    void Reserve(uint64_t numWords)
    {
        KqReserve(m_text, m_text.length() + static_cast<size_t>(numWords * 64 / m_base));
    }

    // The digits of the words, the last word's highest row first.
    void AppendWords(const uint64_t* words, size_t numWords);

  private:
    char GetDigit(uint64_t value) const;
    void WriteWords(const uint64_t* words, size_t numWords, char* text) const;

    KQ_BASE m_base;
    bool m_upper_case;
    String& m_text;
};

#endif
