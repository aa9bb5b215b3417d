// A view of an EDIF cell: its instances and what its nets join. Pins are listed by net, not by
// cell, so the cells are made after the whole view is read.
#ifndef BOOLEQ_DESIGN_EDIF_VIEW_H
#define BOOLEQ_DESIGN_EDIF_VIEW_H

#include <vector>

#include "cell_intake.h"
#include "edif_forms.h"

namespace booleq {

struct EdifPort {
    NameId ident = 0; // in EdifReader::m_idents; pins refer to the port by it
    NameId name = 0;  // without a range, "A" of "A[5:0]"
    uint32_t numBits = 1;
    PortDirection direction = PortDirection::Both;
};

struct EdifCell {
    NameId type = 0;           // the name of its module, unique for each cell
    std::string_view typeText; // the name of its type, which may be a known one
    std::vector<EdifPort> ports;
};

// A pin of an instance, or of the cell itself, on a net.
struct EdifJoint {
    uint32_t instance; // kNone: a port of the cell itself
    uint32_t port;
    uint32_t member; // 0 is the most significant bit
    LocalNet net;
};

struct EdifInstance {
    NameId name = 0;
    NameId key = 0;
    uint32_t cell = 0;
    uint32_t line = 0;
    uint32_t firstProperty = 0;
    uint32_t numProperties = 0;
};

struct EdifProperty {
    std::string_view name;
    CellValue value;
};

// Invariant: joints, instances and properties belong to the view begun last.
class EdifView {
  public:
    static constexpr uint32_t kNone = UINT32_MAX;

    explicit EdifView(const ReadJob& job)
        : m_job(job), m_pace(job), m_intake(job.design, job.cellTypes, BareDigits::ByFormat)
    {
    }

    // Begins a view, which becomes a module of that name.
    void Begin(NameId module);

    LocalNet AddNet(std::string_view name);
    // A bit of a port that no net joins becomes a net itself.
    void MakePorts(const EdifCell& cell);
    // Makes the cells from the joints, sorted by instance, then by port and bit: the order of the
    // pins of the cell.
    void MakeCells(const std::vector<EdifCell>& cells);
    // The type of a cell if this port may have any number of bits, else null. Yosys writes one cell
    // $lut for all widths, with the number of bits of one of them. Each instance has its own width,
    // from which members count.
    const CellType* VectorType(const EdifCell& cell, const EdifPort& port) const;

    std::vector<EdifInstance> instances;
    std::vector<EdifProperty> properties;
    std::vector<EdifJoint> joints;

  private:
    LocalNet PortNet(const EdifPort& port, uint32_t bit, LocalNet joined);
    static uint32_t BitOf(const EdifJoint& joint, uint32_t numBits);
    void MakeCell(const EdifInstance& instance, const std::vector<EdifCell>& cells,
                  EdifJoint* first, EdifJoint* last);
    // The joints of one port, the last member first.
    void AddPin(const EdifInstance& instance, const EdifCell& cell, const EdifJoint* first,
                const EdifJoint* last);
    // 0 if the instance does not give one; then the width is the number of bits joined.
    uint32_t OwnWidth(const EdifInstance& instance, const CellType& type) const;

    const ReadJob& m_job;
    Pace m_pace;
    CellIntake m_intake;
    ModuleContent* m_module = nullptr;
    std::vector<LocalNet> m_pin_nets;
};

} // namespace booleq

#endif
