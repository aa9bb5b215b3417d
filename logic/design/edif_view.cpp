#include "edif_view.h"

#include <algorithm>
#include <cassert>

#include "read_fault.h"

namespace booleq {

void EdifView::Begin(NameId module)
{
    m_job.modules.emplace_back();
    m_module = &m_job.modules.back();
    m_module->name = module;
    m_intake.EnterModule(*m_module);
    instances.clear();
    properties.clear();
    joints.clear();
}

LocalNet EdifView::AddNet(std::string_view name)
{
    m_module->netNames.push_back(m_job.design.names.Add(name));
    m_module->isHidden.push_back(!name.empty() && name[0] == '$');
    return static_cast<LocalNet>(m_module->netNames.size() - 1);
}

void EdifView::MakePorts(const EdifCell& cell)
{
    std::vector<uint32_t> first;
    uint32_t numBits = 0;
    for (const EdifPort& port : cell.ports) {
        first.push_back(numBits);
        numBits += port.numBits;
        if (numBits > kMaxPortBits * 16)
            throw ReadFault{"the ports of the cell have too many bits"};
    }
    std::vector<LocalNet> nets(numBits, 0);
    for (const EdifJoint& joint : joints) {
        if (joint.instance != kNone)
            continue;
        LocalNet& net = nets[first[joint.port] + BitOf(joint, cell.ports[joint.port].numBits)];
        if (net == 0)
            net = joint.net;
        else
            m_module->joins.emplace_back(net, joint.net);
    }
    for (size_t index = 0; index < first.size(); ++index) {
        const EdifPort& port = cell.ports[index];
        ModulePort made;
        made.bits = {port.name, static_cast<uint32_t>(m_module->bits.size()), port.numBits};
        made.direction = port.direction;
        for (uint32_t bit = 0; bit < port.numBits; ++bit)
            m_module->bits.push_back(PortNet(port, bit, nets[first[index] + bit]));
        m_module->ports.push_back(made);
    }
}

LocalNet EdifView::PortNet(const EdifPort& port, uint32_t bit, LocalNet joined)
{
    std::string text(m_job.design.names.Text(port.name));
    if (port.numBits != 1)
        text += "[" + std::to_string(bit) + "]";
    if (joined == 0)
        return AddNet(text);
    const NameId name = m_job.design.names.Add(text);
    if (name != m_module->netNames[joined])
        m_module->aliases.push_back({joined, name});
    return joined;
}

uint32_t EdifView::BitOf(const EdifJoint& joint, uint32_t numBits)
{
    assert(joint.member < numBits);
    return numBits - 1 - joint.member;
}

void EdifView::MakeCells(const std::vector<EdifCell>& cells)
{
    std::vector<uint32_t> starts(instances.size() + 1, 0);
    for (const EdifJoint& joint : joints)
        if (joint.instance != kNone)
            ++starts[joint.instance + 1];
    for (size_t instance = 0; instance < instances.size(); ++instance)
        starts[instance + 1] += starts[instance];
    std::vector<EdifJoint> sorted(starts.back());
    std::vector<uint32_t> places(starts.begin(), starts.end() - 1);
    for (const EdifJoint& joint : joints)
        if (joint.instance != kNone)
            sorted[places[joint.instance]++] = joint;
    for (size_t instance = 0; instance < instances.size(); ++instance)
        MakeCell(instances[instance], cells, sorted.data() + starts[instance],
                 sorted.data() + starts[instance + 1]);
}

void EdifView::MakeCell(const EdifInstance& instance, const std::vector<EdifCell>& cells,
                        EdifJoint* first, EdifJoint* last)
{
    if (m_pace.IsDue())
        m_pace.Report(m_job.source.Text().size());
    std::sort(first, last, [](const EdifJoint& left, const EdifJoint& right) {
        return left.port != right.port ? left.port < right.port : left.member > right.member;
    });
    const EdifCell& cell = cells[instance.cell];
    m_intake.Begin(instance.name, instance.line);
    m_intake.SetKey(instance.key);
    m_intake.SetType(m_job.cellTypes.Find(std::string(cell.typeText)) != nullptr
                         ? cell.typeText
                         : m_job.design.names.Text(cell.type));
    for (uint32_t property = 0; property < instance.numProperties; ++property) {
        const EdifProperty& own = properties[instance.firstProperty + property];
        m_intake.AddParameter(own.name, own.value);
    }
    while (first != last) {
        EdifJoint* end = first;
        while (end != last && end->port == first->port)
            ++end;
        AddPin(instance, cell, first, end);
        first = end;
    }
    m_intake.End();
}

void EdifView::AddPin(const EdifInstance& instance, const EdifCell& cell, const EdifJoint* first,
                      const EdifJoint* last)
{
    const EdifPort& port = cell.ports[first->port];
    const CellType* vector = VectorType(cell, port);
    const uint32_t numBits =
        vector == nullptr ? port.numBits : std::max(first->member + 1, OwnWidth(instance, *vector));
    m_pin_nets.assign(numBits, kNetOpen);
    for (const EdifJoint* joint = first; joint != last; ++joint) {
        LocalNet& net = m_pin_nets[BitOf(*joint, numBits)];
        if (net == kNetOpen)
            net = joint->net;
        else
            m_module->joins.emplace_back(net, joint->net);
    }
    m_intake.AddPin(m_job.design.names.Text(port.name), m_pin_nets.data(), m_pin_nets.size());
}

const CellType* EdifView::VectorType(const EdifCell& cell, const EdifPort& port) const
{
    const std::vector<uint32_t>* variants = m_job.cellTypes.Find(std::string(cell.typeText));
    if (variants == nullptr)
        return nullptr;
    const CellType& type = m_job.cellTypes.All()[variants->front()];
    return !type.vectorPin.empty() && type.vectorPin == m_job.design.names.Text(port.name)
               ? &type
               : nullptr;
}

uint32_t EdifView::OwnWidth(const EdifInstance& instance, const CellType& type) const
{
    for (uint32_t property = 0; property < instance.numProperties; ++property) {
        const EdifProperty& own = properties[instance.firstProperty + property];
        if (own.name == type.widthParameter && own.value.isNumber &&
            own.value.number <= kMaxPortBits)
            return static_cast<uint32_t>(own.value.number);
    }
    return 0;
}

} // namespace booleq
