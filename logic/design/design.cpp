#include "design.h"

#include <algorithm>
#include <cassert>

namespace booleq {

namespace {

struct CodeText {
    const char* word;
    const char* sentence;
};

constexpr CodeText kCodeTexts[] = {
    {"init-short",
     "the init value has fewer digits than the table has rows; the missing ones count as 0"},
    {"init-long",
     "the init value has more digits than the table has rows; the first ones are ignored"},
    {"init-unknown", "the init value has x or z digits; they count as 0"},
    {"init-missing", "the cell has no init value; the default of its type is used"},
    {"init-illegible", "the init value is not a number; the cell is not read"},
    {"width", "the width parameter is not the number of inputs; the inputs count"},
    {"pin-open", "an input is not connected"},
    {"pin-unknown", "an input is tied to x or z"},
    {"pin-strange", "the cell's type has no such pin; the cell is not read"},
    {"pin-twice", "a pin is connected twice; the first connection counts"},
    {"too-wide", "the table has more than 16 inputs; the cell is not read"},
    {"mode-unread", "in this mode the cell is more than a look-up table; it is not read"},
    {"cover-mixed", "the table has both rows of 0 and rows of 1; it is not read"},
    {"buffer", "the table only passes a net: the two nets are one, and it is not counted"},
    {"constant-net", "the table has no inputs: its net is constant, and it is not counted"},
    {"name-twice", "another cell has the same name"},
    {"driver-twice", "the net has a second driver"},
    {"module-unused", "the module is not below the top; it is not read"},
    {"port-strange", "the module of the instance has no such port"},
    {"port-width", "the instance connects a different number of bits than the port has"},
};
static_assert(sizeof kCodeTexts / sizeof *kCodeTexts ==
                  static_cast<size_t>(FindingCode::NumFindingCodes),
              "a text for each code");

const CodeText& TextOf(FindingCode code)
{
    assert(code != FindingCode::NumFindingCodes);
    return kCodeTexts[static_cast<size_t>(code)];
}

} // namespace

const char* CodeWord(FindingCode code)
{
    return TextOf(code).word;
}

const char* CodeSentence(FindingCode code)
{
    return TextOf(code).sentence;
}

std::string Path(const Design& design, const ScopedName& name)
{
    std::vector<NameId> parts = {name.name};
    for (ScopeId scope = name.scope; scope != 0; scope = design.scopes[scope].parent) {
        assert(design.scopes[scope].parent < scope); // so the loop ends
        parts.push_back(design.scopes[scope].name);
    }
    std::string path;
    for (size_t part = parts.size(); part-- > 0;) {
        path += design.names.Text(parts[part]);
        if (part != 0)
            path += '.';
    }
    return path;
}

std::string NetName(const Design& design, NetId net)
{
    static constexpr const char* kFixed[kNumFixedNets] = {"1'b0", "1'b1", "1'bx", "(open)"};
    return net < kNumFixedNets ? kFixed[net] : Path(design, design.nets[net]);
}

std::string TableName(const Design& design, uint32_t table)
{
    const DesignTable& own = design.tables[table];
    const std::vector<std::string>& pins = design.types[own.type].outputPins;
    const std::string path = Path(design, own.name);
    return pins.size() > 1 ? path + " (" + pins[own.outputPin] + ")" : path;
}

} // namespace booleq
