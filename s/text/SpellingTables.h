// The tokenizer's tables, made from the table of spellings at compile time: what a character
// starts, what may follow a negation character, which words stand between dots.
#ifndef KQ_SPELLINGTABLES_H
#define KQ_SPELLINGTABLES_H

#include "Spelling.h"

namespace KqTables {

typedef Kq_BoolEquationImp::Node Node;

// What a character starts.
enum CLASS : uint8_t {
    REFUSED,
    BLANK,
    NAME,
    DIGIT_OF_NAME,
    CONSTANT,
    SINGLE,
    NEGATION,
    KEYWORD,
    QUOTE
};

struct Character {
    CLASS startsA;
    KqSpellingId spelling; // of CONSTANT, SINGLE and NEGATION: the character alone
};

template <class Entry>
struct ByCharacter {
    Entry of[256];

    constexpr const Entry& operator[](char character) const
    {
        return of[static_cast<unsigned char>(character)];
    }
    constexpr Entry& At(char character) { return of[static_cast<unsigned char>(character)]; }
};

typedef ByCharacter<Character> Characters;

constexpr CLASS ClassOf(Node::TYPE type)
{
    if (type == Node::NOT)
        return NEGATION;
    return type == Node::ZERO || type == Node::ONE ? CONSTANT : SINGLE;
}

constexpr bool IsWord(const char* spelling)
{
    return spelling[0] == '.';
}

constexpr Characters MakeCharacters()
{
    Characters table = {};
    for (Character& character : table.of)
        character = {REFUSED, kKqNoSpelling};
    for (char letter = 0; letter < 26; ++letter) {
        table.At(static_cast<char>('A' + letter)).startsA = NAME;
        table.At(static_cast<char>('a' + letter)).startsA = NAME;
    }
    table.At('_').startsA = NAME;
    for (char digit = '0'; digit <= '9'; ++digit)
        table.At(digit).startsA = DIGIT_OF_NAME;
    for (const char blank : {' ', '\t', '\n'})
        table.At(blank).startsA = BLANK;
    table.At('.').startsA = KEYWORD;
    table.At('\'').startsA = QUOTE;
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        if (!kKqSpellings[id].text[1])
            table.At(kKqSpellings[id].text[0]) = {ClassOf(kKqSpellings[id].type), id};
    }
    return table;
}

constexpr Characters kCharacters = MakeCharacters();

// The spellings that start with one negation character, by the character after it. An operator
// written directly after it belongs to it: "~&" is always one NAND, never a NOT and an AND.
struct Negations {
    char prefix;
    ByCharacter<KqSpellingId> next;
};

constexpr size_t CountSpellings(bool (*isCounted)(const KqSpelling&))
{
    size_t count = 0;
    for (const KqSpelling& spelling : kKqSpellings)
        count += isCounted(spelling) ? 1u : 0u;
    return count;
}

constexpr bool IsNegation(const KqSpelling& spelling)
{
    return spelling.type == Node::NOT && !IsWord(spelling.text);
}

constexpr bool IsKeyword(const KqSpelling& spelling)
{
    return IsWord(spelling.text);
}

constexpr Negations MakeNegations(KqSpellingId lone)
{
    Negations table = {kKqSpellings[lone].text[0], {}};
    for (KqSpellingId& id : table.next.of)
        id = lone;
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        const char* const text = kKqSpellings[id].text;
        if (text[0] == table.prefix && text[1])
            table.next.At(text[1]) = id;
    }
    return table;
}

template <class Entry, size_t kSize>
struct Table {
    Entry of[kSize];
};

constexpr size_t kNumNegations = CountSpellings(IsNegation);
constexpr size_t kNumKeywords = CountSpellings(IsKeyword);

constexpr Table<Negations, kNumNegations> MakeAllNegations()
{
    Table<Negations, kNumNegations> tables = {};
    size_t size = 0;
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        if (IsNegation(kKqSpellings[id]))
            tables.of[size++] = MakeNegations(id);
    }
    return tables;
}

constexpr Table<KqSpellingId, kNumKeywords> MakeKeywords()
{
    Table<KqSpellingId, kNumKeywords> keywords = {};
    size_t size = 0;
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        if (IsKeyword(kKqSpellings[id]))
            keywords.of[size++] = id;
    }
    return keywords;
}

constexpr Table<Negations, kNumNegations> kNegations = MakeAllNegations();
constexpr Table<KqSpellingId, kNumKeywords> kKeywords = MakeKeywords();

// Whether the scan can find a spelling: a single sign, a negation sign followed by another sign, or
// a word that ends at its second dot. No other row may have the same text.
constexpr bool IsFound(KqSpellingId id)
{
    const char* const text = kKqSpellings[id].text;
    if (KqSpellingOf(text) != id)
        return false;
    if (IsWord(text)) {
        const char* end = text + 1;
        while (*end && *end != '.')
            ++end;
        return *end == '.' && !end[1];
    }
    if (!text[1])
        return kCharacters[text[0]].spelling == id && kCharacters[text[0]].startsA >= CONSTANT;
    return !text[2] && kCharacters[text[0]].startsA == NEGATION;
}

constexpr bool AreAllFound()
{
    for (KqSpellingId id = 0; id < kKqNumSpellings; ++id) {
        if (!IsFound(id))
            return false;
    }
    return true;
}

static_assert(AreAllFound(), "the scan finds every row of the table of spellings");

} // namespace KqTables

#endif
