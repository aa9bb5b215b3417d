#include "hierarchy.h"

#include <algorithm>
#include <cassert>
#include <unordered_map>

#include "net_joiner.h"
#include "read_fault.h"
#include "watch.h"

namespace booleq {

namespace {

constexpr uint32_t kNone = UINT32_MAX;

class Layout {
  public:
    Layout(std::vector<ModuleContent>& modules, const LayoutOptions& options, Design& design)
        : m_modules(modules), m_options(options), m_design(design), m_is_on_path(modules.size()),
          m_is_reached(modules.size())
    {
        for (uint32_t module = 0; module < modules.size(); ++module) {
            const bool isNew = m_by_name.emplace(modules[module].name, module).second;
            assert(isNew);
            static_cast<void>(isNew);
        }
    }

    void Run()
    {
        const uint32_t top = FindTop();
        m_design.top = m_modules[top].name;
        m_design.nets.resize(kNumFixedNets);
        Enter(top, 0, nullptr, nullptr);
        AddPorts(m_path.back());
        while (!m_path.empty())
            Step();
        ReportUnused();
        m_modules.clear();
        m_joiner.Apply(m_design);
        NameByOutputs();
        CheckDrivers();
        CheckNames();
        if (!m_options.hasKeys)
            m_design.keys.clear();
    }

  private:
    // An instance whose cells are being laid out.
    struct Frame {
        uint32_t module;
        ScopeId scope;
        size_t nextPending = 0;
        std::vector<NetId> nets; // the net of the design for each local net
    };

    bool IsModule(NameId type, uint32_t& module) const
    {
        const auto found = m_by_name.find(type);
        if (found == m_by_name.end() || m_modules[found->second].isBlackBox)
            return false;
        module = found->second;
        return true;
    }

    std::string NameOf(uint32_t module) const
    {
        return Quoted(m_design.names.Text(m_modules[module].name));
    }

    uint32_t FindTop() const
    {
        if (!m_options.top.empty()) {
            const auto found = m_by_name.find(m_design.names.Find(m_options.top));
            if (found == m_by_name.end())
                throw ReadFault{"there is no module " + Quoted(m_options.top)};
            return found->second;
        }
        if (m_modules.empty())
            throw ReadFault{"there is no module in the file"};
        if (m_options.isFirstTop)
            return 0;
        std::vector<uint32_t> marked;
        for (uint32_t module = 0; module < m_modules.size(); ++module)
            if (m_modules[module].isTop)
                marked.push_back(module);
        return OnlyOne(marked.empty() ? Roots() : marked);
    }

    std::vector<uint32_t> Roots() const
    {
        std::vector<bool> isUsed(m_modules.size(), false);
        uint32_t used = 0;
        for (const ModuleContent& module : m_modules)
            for (const PendingCell& cell : module.pending)
                if (IsModule(cell.type, used))
                    isUsed[used] = true;
        std::vector<uint32_t> roots;
        for (uint32_t module = 0; module < m_modules.size(); ++module)
            if (!isUsed[module] && !m_modules[module].isBlackBox)
                roots.push_back(module);
        return roots;
    }

    uint32_t OnlyOne(const std::vector<uint32_t>& candidates) const
    {
        if (candidates.size() == 1)
            return candidates[0];
        if (candidates.empty())
            throw ReadFault{"no module can be the top: each is used by another or has no cells"};
        throw ReadFault{"several modules can be the top, " + NameOf(candidates[0]) + " and " +
                        NameOf(candidates[1]) + " among " + std::to_string(candidates.size()) +
                        "; say which one"};
    }

    void Step()
    {
        Watch();
        Frame& frame = m_path.back();
        const ModuleContent& module = m_modules[frame.module];
        if (frame.nextPending == module.pending.size()) {
            m_is_on_path[frame.module] = false;
            m_path.pop_back();
            return;
        }
        const PendingCell& cell = module.pending[frame.nextPending++];
        uint32_t used = 0;
        const bool isInstance = IsModule(cell.type, used);
        ++m_design.types[TypeOf(cell.type, isInstance)].numCells;
        if (!isInstance) {
            ++m_design.numCells;
            return;
        }
        m_design.scopes.push_back({frame.scope, cell.name});
        Enter(used, static_cast<ScopeId>(m_design.scopes.size() - 1), &frame, &cell);
    }

    uint32_t TypeOf(NameId name, bool isInstance)
    {
        const auto added = m_types.emplace(name, static_cast<uint32_t>(m_design.types.size()));
        if (added.second) {
            DesignType type;
            type.name = name;
            type.role = isInstance ? CellRole::Module : CellRole::Other;
            m_design.types.push_back(std::move(type));
        }
        return added.first->second;
    }

    // Lays out the cells of a module; 'parent' and 'cell' are null for the top.
    void Enter(uint32_t module, ScopeId scope, const Frame* parent, const PendingCell* cell)
    {
        ModuleContent& content = m_modules[module];
        if (m_is_on_path[module])
            throw ReadFault{"module " + NameOf(module) + " contains itself"};
        m_num_items += content.netNames.size() + content.tables.size() + 1;
        if (m_num_items > m_options.maxItems)
            throw ReadFault{"with its hierarchy flattened the design has more than " +
                            std::to_string(m_options.maxItems) + " nets and cells"};
        m_is_on_path[module] = true;
        m_is_reached[module] = true;
        Frame frame;
        frame.module = module;
        frame.scope = scope;
        frame.nets.assign(content.netNames.size(), kNone);
        for (NetId net = 0; net < kNumFixedNets; ++net)
            frame.nets[net] = net;
        if (parent != nullptr)
            BindPorts(*parent, *cell, frame);
        MakeNets(content, frame);
        for (const auto& join : content.joins)
            m_joiner.Join(frame.nets[join.first], frame.nets[join.second]);
        AppendCells(content, frame);
        m_path.push_back(std::move(frame)); // 'parent' and 'cell' may dangle from here on
    }

    void BindPorts(const Frame& parent, const PendingCell& cell, Frame& frame)
    {
        const ModuleContent& outer = m_modules[parent.module];
        const ModuleContent& inner = m_modules[frame.module];
        std::unordered_map<NameId, const BitRange*> ports;
        for (const ModulePort& port : inner.ports)
            ports.emplace(port.bits.name, &port.bits);
        for (uint32_t index = 0; index < cell.numPins; ++index) {
            const BitRange& pin = outer.pins[cell.firstPin + index];
            const auto found = ports.find(pin.name);
            if (found == ports.end()) {
                Report(FindingCode::PortStrange, parent.scope, cell, pin.name);
                continue;
            }
            const BitRange& port = *found->second;
            if (pin.count != 0 && pin.count != port.count)
                Report(FindingCode::PortWidth, parent.scope, cell, pin.name);
            for (uint32_t bit = 0; bit < std::min(pin.count, port.count); ++bit)
                Bind(parent.nets[outer.bits[pin.first + bit]], inner.bits[port.first + bit], frame);
        }
    }

    // An open or unknown pin leaves the port's net separate.
    void Bind(NetId outer, LocalNet inner, Frame& frame)
    {
        if (outer == kNetOpen || outer == kNetUnknown)
            return;
        if (frame.nets[inner] == kNone)
            frame.nets[inner] = outer;
        else if (inner != kNetOpen && inner != kNetUnknown)
            m_joiner.Join(frame.nets[inner], outer);
    }

    void MakeNets(const ModuleContent& content, Frame& frame)
    {
        for (LocalNet local = kNumFixedNets; local < frame.nets.size(); ++local) {
            const ScopedName name = {frame.scope, content.netNames[local]};
            if (frame.nets[local] != kNone) {
                m_design.aliases.emplace_back(frame.nets[local], name);
                continue;
            }
            frame.nets[local] = static_cast<NetId>(m_design.nets.size());
            m_design.nets.push_back(name);
            if (content.isHidden[local])
                m_joiner.Hide(frame.nets[local]);
        }
        for (const NetAlias& alias : content.aliases)
            if (alias.net != kNetOpen && alias.net != kNetUnknown)
                m_design.aliases.emplace_back(frame.nets[alias.net],
                                              ScopedName{frame.scope, alias.name});
    }

    // The top's cells are moved: it is laid out once, and its nets are those of the design.
    void AppendCells(ModuleContent& content, const Frame& frame)
    {
        const auto numTables = static_cast<uint32_t>(m_design.tables.size());
        const auto numInputs = static_cast<uint32_t>(m_design.inputs.size());
        if (frame.scope == 0) {
            assert(numTables == 0);
            m_design.tables = std::move(content.tables);
            m_design.inputs = std::move(content.inputs);
            m_design.keys = std::move(content.keys);
        } else {
            CopyCells(content, frame, numInputs);
        }
        for (UnreadCell cell : content.unread) {
            cell.name.scope = frame.scope;
            m_design.unread.push_back(cell);
        }
        for (ReadFinding finding : content.findings) {
            finding.name.scope = frame.scope;
            if (finding.table != ReadFinding::kNoTable)
                finding.table += numTables;
            m_design.findings.push_back(std::move(finding));
        }
        for (size_t type = 0; type < content.typeCounts.size(); ++type) {
            m_design.types[type].numCells += content.typeCounts[type];
            m_design.numCells += content.typeCounts[type];
        }
    }

    void CopyCells(const ModuleContent& content, const Frame& frame, uint32_t numInputs)
    {
        if (content.inputs.size() > UINT32_MAX - numInputs)
            throw ReadFault{"more than 2^32 inputs of tables"};
        for (DesignTable table : content.tables) {
            table.name.scope = frame.scope;
            table.firstInput += numInputs;
            table.output = frame.nets[table.output];
            m_design.tables.push_back(table);
        }
        for (const LocalNet input : content.inputs)
            m_design.inputs.push_back(frame.nets[input]);
        m_design.keys.insert(m_design.keys.end(), content.keys.begin(), content.keys.end());
    }

    void Report(FindingCode code, ScopeId scope, const PendingCell& cell, NameId pin)
    {
        ReadFinding finding;
        finding.code = code;
        finding.line = cell.line;
        finding.name = {scope, cell.name};
        finding.text = m_design.names.Text(pin);
        m_design.findings.push_back(std::move(finding));
    }

    void ReportUnused()
    {
        for (size_t module = 0; module < m_modules.size(); ++module) {
            const ModuleContent& content = m_modules[module];
            if (m_is_reached[module] || content.isBlackBox || content.tables.empty())
                continue;
            ReadFinding finding;
            finding.code = FindingCode::ModuleUnused;
            finding.name = {0, content.name};
            m_design.findings.push_back(std::move(finding));
        }
    }

    // Gives tables without a name the name that their output net now shows, in their findings as
    // well.
    void NameByOutputs()
    {
        for (DesignTable& table : m_design.tables)
            if (table.isNamedByOutput && table.output >= kNumFixedNets)
                table.name = m_design.nets[table.output];
        for (ReadFinding& finding : m_design.findings)
            if (finding.table != ReadFinding::kNoTable)
                finding.name = m_design.tables[finding.table].name;
    }

    void AddPorts(const Frame& frame)
    {
        const ModuleContent& content = m_modules[frame.module];
        for (const ModulePort& port : content.ports) {
            const std::string name(m_design.names.Text(port.bits.name));
            for (uint32_t bit = 0; bit < port.bits.count; ++bit) {
                DesignPort made;
                made.name = port.bits.count == 1
                                ? port.bits.name
                                : m_design.names.Add(name + "[" + std::to_string(bit) + "]");
                made.net = frame.nets[content.bits[port.bits.first + bit]];
                made.direction = port.direction;
                m_design.ports.push_back(made);
            }
        }
    }

    void ReportTable(FindingCode code, uint32_t index, const std::string& text)
    {
        const DesignTable& table = m_design.tables[index];
        ReadFinding finding;
        finding.code = code;
        finding.line = table.line;
        finding.table = index;
        finding.name = table.name;
        finding.text = text;
        m_design.findings.push_back(std::move(finding));
    }

    // The tables of one scope are consecutive.
    void CheckNames()
    {
        std::vector<uint32_t> lastWith(m_design.names.Size(), kNone);
        for (uint32_t index = 0; index < m_design.tables.size(); ++index) {
            const DesignTable& table = m_design.tables[index];
            if (table.isNamedByOutput)
                continue;
            uint32_t& last = lastWith[table.name.name];
            const bool isTwice = last != kNone &&
                                 m_design.tables[last].name.scope == table.name.scope &&
                                 !IsSameCell(last, index);
            if (isTwice)
                ReportTable(FindingCode::NameTwice, index, "");
            last = index;
        }
    }

    // The outputs of one cell are consecutive, in ascending order, and no output occurs twice.
    bool IsSameCell(uint32_t first, uint32_t second) const
    {
        return second == first + 1 &&
               m_design.tables[first].outputPin < m_design.tables[second].outputPin &&
               m_design.tables[first].type == m_design.tables[second].type;
    }

    void CheckDrivers()
    {
        std::vector<bool> isDriven(m_design.nets.size(), false);
        for (uint32_t index = 0; index < m_design.tables.size(); ++index) {
            const DesignTable& table = m_design.tables[index];
            if (table.output < kNumFixedNets)
                continue;
            if (isDriven[table.output])
                ReportTable(FindingCode::DriverTwice, index, NetName(m_design, table.output));
            isDriven[table.output] = true;
        }
    }

    std::vector<ModuleContent>& m_modules;
    const LayoutOptions& m_options;
    Design& m_design;
    std::unordered_map<NameId, uint32_t> m_by_name;
    std::unordered_map<NameId, uint32_t> m_types; // modules and types that are not tables
    std::vector<bool> m_is_on_path;
    std::vector<bool> m_is_reached;
    std::vector<Frame> m_path;
    NetJoiner m_joiner;
    uint64_t m_num_items = 0;
};

} // namespace

void LayOut(std::vector<ModuleContent>& modules, const LayoutOptions& options, Design& design)
{
    Layout(modules, options, design).Run();
}

} // namespace booleq
