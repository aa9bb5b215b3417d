// The table of spellings as host strings, made once and shared by all nodes.
#include "Spelling.h"

typedef Port::StringBase<char> String;

namespace {

struct Texts {
    Texts()
    {
        for (KqSpellingId id = 0; id < kKqNumSpellings; ++id)
            m_spellings[id] = KqName{kKqSpellings[id].text, 0};
        for (unsigned int type = 0; type <= kKqNumTypes; ++type) {
            m_types[type].name = kKqTypes[type].name;
            for (unsigned int syntax = 0; syntax < 3; ++syntax) {
                if (kKqTypes[type].syntaxes[syntax])
                    m_types[type].syntaxes[syntax] = kKqTypes[type].syntaxes[syntax];
            }
        }
    }

    struct Type {
        String name;
        String syntaxes[3];
    };

    KqName m_spellings[kKqNumSpellings];
    Type m_types[kKqNumTypes + 1];
};

const Texts& GetTexts()
{
    static const Texts texts;
    return texts;
}

// Every corrupt value shares the row after the last type.
unsigned int RowOf(unsigned int type)
{
    return type < kKqNumTypes ? type : kKqNumTypes;
}

} // namespace

const KqName& KqGetSpelling(KqSpellingId id)
{
    return GetTexts().m_spellings[id];
}

const String* KqGetTypeSpelling(unsigned int type, unsigned int syntaxIndex)
{
    const unsigned int row = RowOf(type);
    return kKqTypes[row].syntaxes[syntaxIndex] ? &GetTexts().m_types[row].syntaxes[syntaxIndex]
                                               : nullptr;
}

const String& KqGetTypeName(unsigned int type)
{
    return GetTexts().m_types[RowOf(type)].name;
}
