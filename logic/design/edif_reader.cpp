// Reads EDIF 2.0.0: libraries of cells, each with an interface of ports and a view of instances and
// nets. Pins are listed by net, not by cell, so the cells of a view are made after all of it is
// read.
#include <algorithm>
#include <unordered_map>

#include "edif_view.h"
#include "read_fault.h"
#include "readers.h"

namespace booleq {

namespace {

class EdifReader {
  public:
    explicit EdifReader(const ReadJob& job)
        : m_job(job), m_forms(job), m_tokens(m_forms.Tokens()), m_view(job)
    {
    }

    void Read()
    {
        m_tokens.Next();
        if (!m_tokens.IsOpen("edif"))
            m_forms.Refuse("expected (edif ...");
        m_forms.ReadName();
        while (m_forms.NextPart("edif")) {
            if (m_tokens.IsOpen("library") || m_tokens.IsOpen("external"))
                ReadLibrary();
            else if (m_tokens.IsOpen("design"))
                ReadDesignForm();
            else if (m_tokens.IsOpen("edifVersion"))
                m_forms.RequireVersion();
            else
                m_tokens.Skip();
        }
        if (m_tokens.Next() != EdifToken::End)
            m_forms.Refuse("unexpected text after the last ')'");
    }

  private:
    // --- libraries and cells

    void ReadLibrary()
    {
        m_library = m_idents.Add(m_forms.ReadName().ident);
        while (m_forms.NextPart("library")) {
            if (m_tokens.IsOpen("cell"))
                ReadCell();
            else
                m_tokens.Skip();
        }
    }

    static uint64_t CellKey(NameId library, NameId cell) { return uint64_t(library) << 32 | cell; }

    void ReadCell()
    {
        const EdifName name = m_forms.ReadName();
        const auto index = static_cast<uint32_t>(m_cells.size());
        const NameId ident = m_idents.Add(name.ident);
        if (!m_cell_numbers.emplace(CellKey(m_library, ident), index).second)
            m_forms.Refuse("the library has two cells " + Quoted(name.ident));
        m_last_with[ident] = index;
        m_cells.emplace_back();
        m_cells.back().typeText = name.text;
        m_cells.back().type = ModuleName(name.text);
        bool hasContents = false;
        while (m_forms.NextPart("cell")) {
            if (m_tokens.IsOpen("view"))
                ReadView(index, hasContents);
            else
                m_tokens.Skip();
        }
    }

    // Cells of two libraries may share a name; modules may not.
    NameId ModuleName(std::string_view text)
    {
        std::string name(text);
        if (m_job.cellTypes.Find(name) != nullptr)
            return m_job.design.names.Add(name); // a known type is never a module
        for (int number = 2; !m_module_names.emplace(m_job.design.names.Add(name), true).second;
             ++number)
            name = std::string(text) + "#" + std::to_string(number);
        return m_job.design.names.Add(name);
    }

    void ReadView(uint32_t cell, bool& hasContents)
    {
        m_forms.ReadName();
        while (m_forms.NextPart("view")) {
            if (m_tokens.IsOpen("interface")) {
                if (m_cells[cell].ports.empty())
                    ReadInterface(cell);
                else
                    m_tokens.Skip();
            } else if (m_tokens.IsOpen("contents")) {
                if (hasContents)
                    m_forms.Refuse("the cell has a second view with contents");
                hasContents = true;
                ReadContents(cell);
            } else {
                m_tokens.Skip();
            }
        }
    }

    void ReadInterface(uint32_t cell)
    {
        while (m_forms.NextPart("interface")) {
            if (m_tokens.IsOpen("port"))
                ReadPort(m_cells[cell]);
            else
                m_tokens.Skip();
        }
    }

    void ReadPort(EdifCell& cell)
    {
        const EdifName name = m_forms.ReadName();
        EdifPort port;
        port.ident = m_idents.Add(name.ident);
        std::string_view text = name.text;
        if (name.isArray && text.find('[') != std::string_view::npos)
            text = text.substr(0, text.find('[')); // without its range
        port.name = m_job.design.names.Add(text);
        port.numBits = name.numBits;
        while (m_forms.NextPart("port")) {
            if (!m_tokens.IsOpen("direction")) {
                m_tokens.Skip();
                continue;
            }
            m_tokens.Next();
            const std::string_view word = m_tokens.Text();
            port.direction = word == "INPUT"    ? PortDirection::Input
                             : word == "OUTPUT" ? PortDirection::Output
                                                : PortDirection::Both;
            m_forms.Close("direction");
        }
        for (const EdifPort& other : cell.ports)
            if (other.ident == port.ident && cell.ports.size() < 1000) // above, too slow
                m_forms.Refuse("there are two ports " + Quoted(name.ident));
        cell.ports.push_back(port);
    }

    void ReadDesignForm()
    {
        m_forms.ReadName();
        while (m_forms.NextPart("design")) {
            if (!m_tokens.IsOpen("cellRef")) {
                m_tokens.Skip();
                continue;
            }
            const EdifCell& top = m_cells[ReadCellRef()];
            for (ModuleContent& module : m_job.modules)
                if (module.name == top.type)
                    module.isTop = true;
        }
    }

    // The rest of (cellRef name (libraryRef library)), as the number of a cell.
    uint32_t ReadCellRef()
    {
        const EdifName name = m_forms.ReadName();
        NameId library = EdifView::kNone;
        while (m_forms.NextPart("cellRef")) {
            if (!m_tokens.IsOpen("libraryRef")) {
                m_tokens.Skip();
                continue;
            }
            library = m_idents.Add(m_forms.ReadName().ident);
            m_forms.Close("libraryRef");
        }
        const NameId ident = m_idents.Add(name.ident);
        if (library == EdifView::kNone) {
            // The cell of this library, or else the last cell of that name.
            const auto own = m_cell_numbers.find(CellKey(m_library, ident));
            if (own != m_cell_numbers.end())
                return own->second;
            const auto last = m_last_with.find(ident);
            if (last != m_last_with.end())
                return last->second;
        }
        const auto found = m_cell_numbers.find(CellKey(library, ident));
        if (found == m_cell_numbers.end())
            m_forms.Refuse("no cell " + Quoted(name.ident) + " stands before this");
        return found->second;
    }

    // --- contents

    void ReadContents(uint32_t cell)
    {
        m_view.Begin(m_cells[cell].type);
        ++m_epoch;
        ReadContentsParts("contents", cell);
        m_view.MakePorts(m_cells[cell]);
        m_view.MakeCells(m_cells);
    }

    // A bundle of nets is read as the nets in it. A counter follows the nesting, not recursion.
    void ReadContentsParts(const char* form, uint32_t cell)
    {
        uint64_t depth = 1;
        while (depth != 0) {
            if (!m_forms.NextPart(form)) {
                --depth;
                continue;
            }
            if (m_tokens.IsOpen("instance")) {
                ReadInstance();
            } else if (m_tokens.IsOpen("net")) {
                ReadNet(cell);
            } else if (m_tokens.IsOpen("netBundle")) {
                m_forms.ReadName();
                ++depth;
            } else if (m_tokens.IsOpen("listOfNets")) {
                ++depth;
            } else {
                m_tokens.Skip();
            }
        }
    }

    void ReadInstance()
    {
        EdifInstance instance;
        instance.line = static_cast<uint32_t>(m_tokens.Line());
        const EdifName name = m_forms.ReadName();
        if (name.isArray)
            m_forms.Refuse("an array of instances is not read: " + Quoted(name.ident));
        instance.name = m_job.design.names.Add(name.text);
        instance.cell = EdifView::kNone;
        instance.firstProperty = static_cast<uint32_t>(m_view.properties.size());
        while (m_forms.NextPart("instance")) {
            if (m_tokens.IsOpen("viewRef")) {
                m_forms.ReadName();
                while (m_forms.NextPart("viewRef")) {
                    if (m_tokens.IsOpen("cellRef"))
                        instance.cell = ReadCellRef();
                    else
                        m_tokens.Skip();
                }
            } else if (m_tokens.IsOpen("property")) {
                ReadProperty(instance);
            } else {
                m_tokens.Skip();
            }
        }
        if (instance.cell == EdifView::kNone)
            ThrowAtLine(instance.line, "instance " + Quoted(name.text) + " does not name its cell");
        instance.numProperties =
            static_cast<uint32_t>(m_view.properties.size()) - instance.firstProperty;
        Known& known = KnownOf(name.ident);
        if (known.instanceEpoch == m_epoch)
            ThrowAtLine(instance.line, "there are two instances " + Quoted(name.ident));
        known.instanceEpoch = m_epoch;
        known.instance = static_cast<uint32_t>(m_view.instances.size());
        m_view.instances.push_back(instance);
    }

    // (property NAME (string "...")), (integer 6), (boolean (true)).
    void ReadProperty(EdifInstance& instance)
    {
        EdifProperty property;
        property.name = m_forms.ReadName().text;
        if (!m_forms.ReadValue(property.value))
            return;
        if (property.name == m_job.options.keyAttribute)
            instance.key = m_job.design.names.Add(property.value.text);
        m_view.properties.push_back(property);
    }

    void ReadNet(uint32_t cell)
    {
        const EdifName name = m_forms.ReadName();
        if (name.isArray)
            m_forms.Refuse("an array of nets is not read: " + Quoted(name.ident));
        Known& known = KnownOf(name.ident);
        if (known.netEpoch == m_epoch)
            m_forms.Refuse("there are two nets " + Quoted(name.ident));
        known.netEpoch = m_epoch;
        const LocalNet net = m_view.AddNet(name.text);
        while (m_forms.NextPart("net")) {
            if (!m_tokens.IsOpen("joined")) {
                m_tokens.Skip();
                continue;
            }
            while (m_forms.NextPart("joined")) {
                if (m_tokens.IsOpen("portRef"))
                    ReadPortRef(cell, net);
                else
                    m_tokens.Skip();
            }
        }
    }

    // (portRef name (instanceRef instance)) and (portRef (member name index) ...).
    void ReadPortRef(uint32_t cell, LocalNet net)
    {
        EdifJoint joint = {EdifView::kNone, 0, 0, net};
        uint64_t member = EdifView::kNone;
        std::string_view port;
        m_tokens.Next();
        if (m_tokens.IsOpen("member")) {
            m_tokens.Next();
            port = m_forms.CurrentName().ident;
            m_tokens.Next();
            member = m_forms.Number(kMaxPortBits);
            m_forms.Close("member");
        } else {
            port = m_forms.CurrentName().ident;
        }
        while (m_forms.NextPart("portRef")) {
            if (!m_tokens.IsOpen("instanceRef")) {
                m_tokens.Skip();
                continue;
            }
            const std::string_view ident = m_forms.ReadName().ident;
            const Known& known = KnownOf(ident);
            if (known.instanceEpoch != m_epoch)
                m_forms.Refuse("no instance " + Quoted(ident) + " stands before this");
            joint.instance = known.instance;
            m_forms.Close("instanceRef");
        }
        const EdifCell& owner =
            m_cells[joint.instance == EdifView::kNone ? cell
                                                      : m_view.instances[joint.instance].cell];
        joint.port = FindPort(owner, port);
        const uint32_t numBits = owner.ports[joint.port].numBits;
        const bool isVector = m_view.VectorType(owner, owner.ports[joint.port]) != nullptr;
        if (member != EdifView::kNone && member >= numBits && !isVector)
            m_forms.Refuse("port " + Quoted(port) + " has " + Count(numBits, "bit") +
                           ", and no member " + std::to_string(member));
        if (member == EdifView::kNone && numBits != 1 && !isVector)
            m_forms.Refuse("port " + Quoted(port) + " is an array; say which member");
        joint.member = member == EdifView::kNone ? 0 : static_cast<uint32_t>(member);
        m_view.joints.push_back(joint);
    }

    // Most cells have few ports. The ports of a large cell are found by a map that is made once.
    uint32_t FindPort(const EdifCell& cell, std::string_view ident)
    {
        const NameId id = m_idents.Find(ident);
        const auto numPorts = static_cast<uint32_t>(cell.ports.size());
        uint32_t place = numPorts;
        if (numPorts > 16) {
            auto& ports = m_ports_of[static_cast<uint32_t>(&cell - m_cells.data())];
            for (auto port = static_cast<uint32_t>(ports.size()); port < numPorts; ++port)
                ports.emplace(cell.ports[port].ident, port);
            const auto found = ports.find(id);
            if (found != ports.end())
                place = found->second;
        } else {
            for (place = 0; place < numPorts && cell.ports[place].ident != id;)
                ++place;
        }
        if (place == numPorts)
            m_forms.Refuse("cell " + Quoted(cell.typeText) + " has no port " + Quoted(ident));
        return place;
    }

    // What an identifier means in the current view.
    struct Known {
        uint32_t instanceEpoch = 0;
        uint32_t instance = 0;
        uint32_t netEpoch = 0;
    };

    Known& KnownOf(std::string_view ident)
    {
        const NameId id = m_idents.Add(ident);
        if (id >= m_known.size())
            m_known.resize(id + id / 2 + size_t(64));
        return m_known[id];
    }

    const ReadJob& m_job;
    EdifForms m_forms;
    EdifTokens& m_tokens;
    EdifView m_view;

    NameArena m_idents; // the file's identifiers, kept apart from the design's names
    NameId m_library = 0;
    std::vector<EdifCell> m_cells;
    std::unordered_map<uint64_t, uint32_t> m_cell_numbers; // by library and identifier
    std::unordered_map<NameId, uint32_t> m_last_with;      // by identifier
    std::unordered_map<NameId, bool> m_module_names;
    std::unordered_map<uint32_t, std::unordered_map<NameId, uint32_t>> m_ports_of;

    uint32_t m_epoch = 0; // of the view
    std::vector<Known> m_known;
};

} // namespace

void ReadEdif(const ReadJob& job)
{
    EdifReader(job).Read();
}

} // namespace booleq
