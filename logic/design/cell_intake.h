// Takes the cells of a module one by one, in parts as a reader meets them, and makes tables of
// cells whose type is known. Anything odd about a cell becomes a finding.
// Fails: ReadFault for a cell without a type, and where a limit on sizes is passed.
// Cost: proportional to the parts of the cell; no allocation once the scratch space has grown.
#ifndef BOOLEQ_DESIGN_CELL_INTAKE_H
#define BOOLEQ_DESIGN_CELL_INTAKE_H

#include <string_view>
#include <unordered_map>
#include <vector>

#include "cell_types.h"
#include "composed_table.h"
#include "init_digits.h"
#include "init_store.h"
#include "module_content.h"

namespace booleq {

// A parameter's value: a text as written in the file, or a number.
struct CellValue {
    std::string_view text;
    uint64_t number = 0;
    bool isNumber = false;
};

// Sets the number from a text of decimal digits.  Fails: false if the text is anything else or
// needs more than 64 bits; the value then stays a text.
bool TakeNumber(CellValue& value);

// Between Begin and End, views must stay valid.
class CellIntake {
  public:
    // 'bare' says how the format reads digits without a prefix.
    CellIntake(Design& design, const CellTypes& cellTypes, BareDigits bare);

    // The cells that follow belong to this module.
    void EnterModule(ModuleContent& module) { m_module = &module; }

    // A name of 0 means that the cell has none.
    void Begin(NameId name, uint32_t line);
    uint32_t Line() const { return m_line; } // as given to Begin
    void SetType(std::string_view type) { m_type = type; }
    void SetName(NameId name) { m_name = name; }
    void SetKey(NameId key) { m_key = key; }
    void AddParameter(std::string_view name, const CellValue& value);
    void AddPin(std::string_view pin, const LocalNet* nets, size_t numNets);
    // Ends a cell with all its parts.
    void End();

    // Ends a cell, instead of End, whose rows the format itself gives. The inputs begin with the
    // least significant, as in an init value.
    void EndWithRows(const Rows& rows, const std::vector<LocalNet>& inputs, LocalNet output);
    // Ends a cell, instead of End, that cannot be read, for that reason.
    void EndUnread(FindingCode code, const std::string& text);

  private:
    struct Pin {
        std::string_view name;
        uint32_t first; // of m_bits
        uint32_t count;
    };
    struct Parameter {
        std::string_view name;
        CellValue value;
    };
    // What is known about a type name: its variants, and for each of them the type in the design.
    struct KnownType {
        const std::vector<uint32_t>* variants = nullptr;
        std::vector<uint32_t> designTypes;
    };

    KnownType& Known(std::string_view type);
    uint32_t DesignTypeOf(KnownType& known, size_t variant);
    uint32_t AddDesignType(std::string_view name, CellRole role);
    const Pin* FindPin(std::string_view name, size_t hint) const;
    const CellValue* FindValue(std::string_view name) const;
    bool HasAllPins(const CellType& type) const;
    LocalNet InputNet(const std::string& pin, size_t hint, bool isOpenZero);
    LocalNet OutputNet(const std::string& pin);
    void GatherVector(const CellType& type);
    bool IsVectorBit(const CellType& type, std::string_view pin, size_t& bit) const;

    void EndTable(uint32_t cellType, uint32_t designType);
    bool AddOutputs(uint32_t cellType, uint32_t designType);
    void EndVectorTable(const CellType& type, uint32_t designType);
    void RefusePins(KnownType& known);
    void EndPending();
    NameId NameOrLine();
    void EndUnreadOf(uint32_t designType);
    bool IsMet(const CellCondition& condition) const;
    bool AreConditionsMet(const CellStep& step) const;
    bool ReadParameter(const CellParameter& parameter, uint32_t numBits, InitDigits& digits);
    bool AddOutput(const CellType& type, const ComposedTable& output, uint32_t designType);
    void RemoveTables(size_t first);
    InitId AddInit(unsigned int numInputs, const uint64_t* words, const uint64_t* unknown);
    void PushTable(uint32_t designType, size_t outputPin, LocalNet output, InitId init);
    void AddFinding(FindingCode code, const std::string& text);
    void PlaceFindings(uint32_t table);
    void Count(uint32_t designType);

    Design& m_design;
    const CellTypes& m_cell_types;
    BareDigits m_bare;
    InitStore m_inits;
    ModuleContent* m_module = nullptr;
    std::unordered_map<NameId, KnownType> m_known;
    std::vector<std::vector<ComposedTable>>
        m_outputs; // by cell type, in the order of its output pins

    NameId m_name = 0;
    NameId m_key = 0;
    uint32_t m_line = 0;
    std::string_view m_type;
    std::vector<Parameter> m_parameters;
    std::vector<Pin> m_pins;
    std::vector<LocalNet> m_bits;
    std::vector<LocalNet> m_inputs;   // of the table being made
    std::vector<InitDigits> m_digits; // of the type's parameters
    std::vector<uint64_t> m_words;    // of the table being made
    std::vector<uint64_t> m_unknown;
    std::vector<ReadFinding> m_findings; // of this cell, kept until its table is made
};

} // namespace booleq

#endif
