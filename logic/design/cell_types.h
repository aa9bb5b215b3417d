// Types of cells that are look-up tables: which pins, which parameter, which bits of it. They come
// from a text in the form that cells.txt explains; users add files of the same form.
// Fails: false with a message that names file and line; the types are then as they were.
#ifndef BOOLEQ_DESIGN_CELL_TYPES_H
#define BOOLEQ_DESIGN_CELL_TYPES_H

#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace booleq {

enum class CellKind { Table, Constant, Unread };

// How digits without a prefix are read.
enum class BareDigits { ByFormat, Binary, Decimal, Hex };

struct CellParameter {
    std::string name;
    uint32_t numBits = 0;
    BareDigits form = BareDigits::ByFormat;
    uint64_t initial = 0; // its value if a cell does not give one
};

// A condition: the parameter must have this value.
struct CellCondition {
    std::string parameter;
    std::string value;
    bool isInitial = false; // a cell without the parameter meets it
};

// A table within a cell: the whole cell, a half, or one of a tree of tables.
struct CellStep {
    static constexpr uint32_t kLiteral = UINT32_MAX;

    std::string name; // a pin if isOutput
    std::vector<uint32_t>
        inputs; // pins of CellType::inputPins, then steps; least significant first
    uint32_t parameter = kLiteral; // of CellType::parameters; or kLiteral, and then:
    uint64_t literal = 0;
    uint32_t firstBit = 0; // of the parameter: bits firstBit to firstBit + 2^inputs - 1
    bool isOutput = true;
    std::vector<CellCondition> conditions; // unless all hold, this is not an output
};

struct CellType {
    std::string name;
    CellKind kind = CellKind::Table;
    std::vector<std::string> inputPins;  // from the least significant
    std::vector<std::string> outputPins; // of the steps that are outputs, in their order
    std::vector<std::string> otherPins;  // pins on which no table depends
    std::vector<CellParameter> parameters;
    std::vector<CellStep> steps; // a step uses only steps before it
    std::string vectorPin;       // if not empty, the inputs are the bits of this pin, in any number
    std::string widthParameter;  // for such a type; may be empty
    bool isOpenZero = false;     // an input that is not connected is 0, not open
    bool value = false;          // for a constant
    std::string note;            // why the type, or a cell that meets no condition, is not read
};

// Invariant: m_by_name leads to all variants of a name, because device families use one name for
// cells with different pins.
class CellTypes {
  public:
    // The types that this library knows.
    static const CellTypes& Known();
    // The text that defines them: cells.txt.
    static std::string_view KnownText();

    // Adds the types of a text. One with the same name, inputs, outputs and vector pin is replaced.
    bool Add(std::string_view text, const std::string& file, std::string& fault);
    bool AddFile(const std::string& file, std::string& fault);

    // The variants of a name, as places in All(); null if there are none.
    const std::vector<uint32_t>* Find(const std::string& name) const;
    const std::vector<CellType>& All() const { return m_types; }

  private:
    std::vector<CellType> m_types;
    std::unordered_map<std::string, std::vector<uint32_t>> m_by_name;
};

} // namespace booleq

#endif
