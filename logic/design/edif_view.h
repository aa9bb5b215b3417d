// A view of an EDIF cell: its instances and what its nets join. Nets say which pins they have, so
// cells are made when all of it is read.
#ifndef BOOLEQ_DESIGN_EDIF_VIEW_H
#define BOOLEQ_DESIGN_EDIF_VIEW_H

#include <vector>

#include "cell_intake.h"
#include "edif_forms.h"

namespace booleq {

struct EdifPort {
    NameId ident = 0; // of m_idents, by which pins refer to it
    NameId name = 0;  // without a range, "A" of "A[5:0]"
    uint32_t numBits = 1;
    PortDirection direction = PortDirection::Both;
};

struct EdifCell {
    NameId type = 0;           // the name of its module, different for each cell
    std::string_view typeText; // the name of its type, which may be a known one
    std::vector<EdifPort> ports;
};

// A pin of an instance, or of the cell itself, on a net.
struct EdifJoint {
    uint32_t instance; // kNone: a port of the cell itself
    uint32_t port;
    uint32_t member; // from the most significant bit
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

// Invariant: joints, instances and properties are of the view that was begun last.
class EdifView {
  public:
    static constexpr uint32_t kNone = UINT32_MAX;

    explicit EdifView(const ReadJob& job)
        : m_job(job), m_pace(job), m_intake(job.design, job.cellTypes, BareDigits::ByFormat)
    {
    }

    // The view becomes a module of that name.
    void Begin(NameId module);

    LocalNet AddNet(std::string_view name);
    // Each bit of a port is a net of its own where none is joined to it.
    void MakePorts(const EdifCell& cell);
    // Sorted by instance, then by port and bit, which are the pins of its cell in order.
    void MakeCells(const std::vector<EdifCell>& cells);
    // The type of a cell whose port has any number of bits, else null. Yosys has one cell $lut for
    // all of them, with the bits of one: an instance says its own width, and members count from it.
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
    // 0 where the instance does not say it: as many as are joined.
    uint32_t OwnWidth(const EdifInstance& instance, const CellType& type) const;

    const ReadJob& m_job;
    Pace m_pace;
    CellIntake m_intake;
    ModuleContent* m_module = nullptr;
    std::vector<LocalNet> m_pin_nets;
};

} // namespace booleq

#endif
