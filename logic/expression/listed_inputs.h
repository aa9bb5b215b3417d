// How a text becomes an equation: with or without listed inputs.
#ifndef BOOLEQ_EXPRESSION_LISTED_INPUTS_H
#define BOOLEQ_EXPRESSION_LISTED_INPUTS_H

#include <cstdint>
#include <string>
#include <vector>

#include <Kq_BoolEquation.h>

namespace booleq {

struct Reading {
    bool hasInputs = false;
    std::vector<std::string> inputs;     // the first is the most significant
    bool lsbFirst = false;               // an init value's first input is bit 0 of the row number
    bool reverse = false;                // an init value's inputs are defined from the last
    const char* inputsName = "--inputs"; // what the caller's users write to list inputs
};

// Sets 'equation' from 'text', which holds no NUL byte. Over listed inputs an init value may also
// be one that only people write (init_literal.h).  Fails: false.
bool SetFromText(Kq_BoolEquation& equation, const std::string& text, const Reading& reading);
// The same, except that the text must be one that the library itself reads.
bool SetVerbatim(Kq_BoolEquation& equation, const std::string& text, const Reading& reading);

// The inputs of 'reading' as the library takes them, for callers that set many equations over them.
std::vector<Port::StringBase<char>> TermsOf(const Reading& reading);
// SetFromText with such terms.  Requires: they are the terms of the reading, which has inputs.
bool SetOverTerms(Kq_BoolEquation& equation, const std::string& text, const Reading& reading,
                  const std::vector<Port::StringBase<char>>& terms);

// The text that the library is given over these inputs; for a refused text the text itself.
std::string LibraryText(const std::string& text, const Reading& reading);

// True for an equation that was set from an init value.
bool IsInitValue(const Kq_BoolEquation& equation);

// What the length of an init value says about its rows. Only the library reads the digits.
struct InitWidth {
    uint64_t numRows = 0;   // rows that have a digit; 0 if the text is not an init value
    unsigned numInputs = 0; // the library reads the digits over exactly so many inputs
    bool isHex = false;
};
// Assumes that "0x..." and "0b..." are init values, whatever follows.  Cost: constant.
InitWidth WidthOfInit(const std::string& text);

// Names of a list 'A,B,'c,d'': a comma inside single quotes belongs to the name, blanks around a
// name do not.  Fails: false when a quote is not closed.
bool SplitInputs(const std::string& list, std::vector<std::string>& inputs);

// The first name that a text cannot mention, because there it is read as a name and more ('a'+b);
// empty if there is none. Such a name can be listed. An init value over it stands for the
// expression that mentions it.
std::string FirstSplitName(const std::vector<std::string>& names);
// What to say when a text would have to mention such a name.
std::string SplitNameReason(const std::string& name);

// Sorts out the inputs that the library would skip without a message.
struct InputCheck {
    std::vector<std::string> usable;   // each once, in the order listed
    std::vector<std::string> illegal;  // not names; they do not become inputs
    std::vector<std::string> repeated; // listed again; they count once
};
InputCheck CheckInputs(const std::vector<std::string>& inputs);

} // namespace booleq

#endif
