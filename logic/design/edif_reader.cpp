// Reads EDIF 2.0.0: libraries of cells, each with an interface of ports and a view of instances and
// nets. Nets say which pins they join, so the cells of a view are made when all of it is read.
#include <algorithm>
#include <cassert>
#include <deque>
#include <unordered_map>

#include "cell_intake.h"
#include "edif_tokens.h"
#include "read_fault.h"
#include "readers.h"

namespace booleq {

namespace {

constexpr uint32_t kMaxPortBits = 1u << 20;
constexpr uint32_t kNone = UINT32_MAX;

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

// An identifier, and the name that it stands for.
struct EdifName {
    std::string_view ident;
    std::string_view text;
    uint32_t numBits = 1;
    bool isArray = false;
};

class EdifReader {
  public:
    explicit EdifReader(const ReadJob& job)
        : m_job(job), m_pace(job), m_intake(job.design, job.cellTypes, BareDigits::ByFormat),
          m_tokens(job.source.Text())
    {
    }

    void Read()
    {
        m_tokens.Next();
        if (!m_tokens.IsOpen("edif"))
            Refuse("expected (edif ...");
        ReadName();
        while (NextPart("edif")) {
            if (m_tokens.IsOpen("library") || m_tokens.IsOpen("external"))
                ReadLibrary();
            else if (m_tokens.IsOpen("design"))
                ReadDesignForm();
            else
                m_tokens.Skip();
        }
        if (m_tokens.Next() != EdifToken::End)
            Refuse("something follows the last ')'");
    }

  private:
    [[noreturn]] void Refuse(const std::string& what) const { m_tokens.Refuse(what); }

    // The next part of a form; false at its end.
    bool NextPart(const char* form)
    {
        if (m_pace.IsDue())
            m_pace.Report(m_tokens.Position());
        switch (m_tokens.Next()) {
        case EdifToken::Open:
        case EdifToken::Word:
        case EdifToken::String:
            return true;
        case EdifToken::Close:
            return false;
        case EdifToken::End:
            break;
        }
        Refuse(std::string("the text ends within (") + form + " ...");
    }

    void Close(const char* form)
    {
        while (NextPart(form))
            m_tokens.Skip();
    }

    // --- names

    // The strings that had to be decoded, and names that are made: they live as long as the reader.
    std::string_view Decoded(std::string_view text)
    {
        const std::string_view decoded = DecodeEdifString(text, m_buffer);
        if (decoded.data() == text.data())
            return text;
        m_strings.push_back(m_buffer);
        return m_strings.back();
    }

    // A word: an '&' before it only lets it begin with a digit.
    std::string_view Ident() const
    {
        if (m_tokens.Kind() != EdifToken::Word)
            Refuse("expected a name");
        std::string_view ident = m_tokens.Text();
        if (ident.size() > 1 && ident[0] == '&')
            ident.remove_prefix(1);
        return ident;
    }

    // (rename ident "text") or ident, being the current token.
    EdifName CurrentName()
    {
        EdifName name;
        if (m_tokens.IsOpen("rename")) {
            m_tokens.Next();
            name.ident = Ident();
            m_tokens.Next();
            name.text =
                m_tokens.Kind() == EdifToken::String ? Decoded(m_tokens.Text()) : name.ident;
            m_tokens.Skip();
            Close("rename");
            return name;
        }
        if (m_tokens.IsOpen("name")) { // with a place on a drawing
            m_tokens.Next();
            name.ident = name.text = Ident();
            Close("name");
            return name;
        }
        if (m_tokens.Kind() == EdifToken::String) {
            name.ident = name.text = Decoded(m_tokens.Text());
            return name;
        }
        name.ident = name.text = Ident();
        return name;
    }

    // The next token is a name, or an array of one with a number of bits.
    EdifName ReadName()
    {
        m_tokens.Next();
        if (!m_tokens.IsOpen("array"))
            return CurrentName();
        m_tokens.Next();
        EdifName name = CurrentName();
        name.isArray = true;
        m_tokens.Next();
        name.numBits = static_cast<uint32_t>(Number(kMaxPortBits));
        Close("array");
        return name;
    }

    // The current token as a number.
    uint64_t Number(uint64_t max) const
    {
        uint64_t number = 0;
        const std::string_view text = m_tokens.Text();
        bool isNumber = m_tokens.Kind() == EdifToken::Word && !text.empty() && text.size() < 20;
        for (const char character : text) {
            isNumber = isNumber && character >= '0' && character <= '9';
            if (isNumber)
                number = number * 10 + static_cast<uint64_t>(character - '0');
        }
        if (!isNumber || number > max)
            Refuse("expected a number up to " + std::to_string(max) + " instead of " +
                   Quoted(text));
        return number;
    }

    // --- libraries and cells

    void ReadLibrary()
    {
        m_library = m_idents.Add(ReadName().ident);
        while (NextPart("library")) {
            if (m_tokens.IsOpen("cell"))
                ReadCell();
            else
                m_tokens.Skip();
        }
    }

    static uint64_t CellKey(NameId library, NameId cell) { return uint64_t(library) << 32 | cell; }

    void ReadCell()
    {
        const EdifName name = ReadName();
        const auto index = static_cast<uint32_t>(m_cells.size());
        const NameId ident = m_idents.Add(name.ident);
        if (!m_cell_numbers.emplace(CellKey(m_library, ident), index).second)
            Refuse("the library has two cells " + Quoted(name.ident));
        m_last_with[ident] = index;
        m_cells.emplace_back();
        m_cells.back().typeText = name.text;
        m_cells.back().type = ModuleName(name.text);
        bool hasContents = false;
        while (NextPart("cell")) {
            if (m_tokens.IsOpen("view"))
                ReadView(index, hasContents);
            else
                m_tokens.Skip();
        }
    }

    // Cells of two libraries may have one name; modules may not.
    NameId ModuleName(std::string_view text)
    {
        std::string name(text);
        if (m_job.cellTypes.Find(name) != nullptr)
            return m_job.design.names.Add(name); // never a module
        for (int number = 2; !m_module_names.emplace(m_job.design.names.Add(name), true).second;
             ++number)
            name = std::string(text) + "#" + std::to_string(number);
        return m_job.design.names.Add(name);
    }

    void ReadView(uint32_t cell, bool& hasContents)
    {
        ReadName();
        while (NextPart("view")) {
            if (m_tokens.IsOpen("interface")) {
                if (m_cells[cell].ports.empty())
                    ReadInterface(cell);
                else
                    m_tokens.Skip();
            } else if (m_tokens.IsOpen("contents")) {
                if (hasContents)
                    Refuse("the cell has a second view with contents");
                hasContents = true;
                ReadContents(cell);
            } else {
                m_tokens.Skip();
            }
        }
    }

    void ReadInterface(uint32_t cell)
    {
        while (NextPart("interface")) {
            if (m_tokens.IsOpen("port"))
                ReadPort(m_cells[cell]);
            else
                m_tokens.Skip();
        }
    }

    void ReadPort(EdifCell& cell)
    {
        const EdifName name = ReadName();
        EdifPort port;
        port.ident = m_idents.Add(name.ident);
        std::string_view text = name.text;
        if (name.isArray && text.find('[') != std::string_view::npos)
            text = text.substr(0, text.find('[')); // a range
        port.name = m_job.design.names.Add(text);
        port.numBits = name.numBits;
        while (NextPart("port")) {
            if (!m_tokens.IsOpen("direction")) {
                m_tokens.Skip();
                continue;
            }
            m_tokens.Next();
            const std::string_view word = m_tokens.Text();
            port.direction = word == "INPUT"    ? PortDirection::Input
                             : word == "OUTPUT" ? PortDirection::Output
                                                : PortDirection::Both;
            Close("direction");
        }
        for (const EdifPort& other : cell.ports)
            if (other.ident == port.ident && cell.ports.size() < 1000) // else the square would cost
                Refuse("there are two ports " + Quoted(name.ident));
        cell.ports.push_back(port);
    }

    void ReadDesignForm()
    {
        ReadName();
        while (NextPart("design")) {
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
        const EdifName name = ReadName();
        NameId library = kNone;
        while (NextPart("cellRef")) {
            if (!m_tokens.IsOpen("libraryRef")) {
                m_tokens.Skip();
                continue;
            }
            library = m_idents.Add(ReadName().ident);
            Close("libraryRef");
        }
        const NameId ident = m_idents.Add(name.ident);
        if (library == kNone) {
            // That of the library, or the one that stood last.
            const auto own = m_cell_numbers.find(CellKey(m_library, ident));
            if (own != m_cell_numbers.end())
                return own->second;
            const auto last = m_last_with.find(ident);
            if (last != m_last_with.end())
                return last->second;
        }
        const auto found = m_cell_numbers.find(CellKey(library, ident));
        if (found == m_cell_numbers.end())
            Refuse("there is no cell " + Quoted(name.ident) + " before");
        return found->second;
    }

    // --- contents

    void ReadContents(uint32_t cell)
    {
        m_job.modules.emplace_back();
        m_module = &m_job.modules.back();
        m_module->name = m_cells[cell].type;
        m_intake.EnterModule(*m_module);
        m_instances.clear();
        m_properties.clear();
        m_joints.clear();
        ++m_epoch;
        ReadContentsParts("contents", cell);
        MakePorts(cell);
        MakeCells();
    }

    // Bundles of nets are read as the nets in them; they stand in one another twice at most.
    void ReadContentsParts(const char* form, uint32_t cell)
    {
        uint64_t depth = 1;
        while (depth != 0) {
            if (!NextPart(form)) {
                --depth;
                continue;
            }
            if (m_tokens.IsOpen("instance")) {
                ReadInstance();
            } else if (m_tokens.IsOpen("net")) {
                ReadNet(cell);
            } else if (m_tokens.IsOpen("netBundle")) {
                ReadName();
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
        const EdifName name = ReadName();
        if (name.isArray)
            Refuse("an array of instances is not read: " + Quoted(name.ident));
        instance.name = m_job.design.names.Add(name.text);
        instance.cell = kNone;
        instance.firstProperty = static_cast<uint32_t>(m_properties.size());
        while (NextPart("instance")) {
            if (m_tokens.IsOpen("viewRef")) {
                ReadName();
                while (NextPart("viewRef")) {
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
        if (instance.cell == kNone)
            ThrowAtLine(instance.line, "instance " + Quoted(name.text) + " does not say its cell");
        instance.numProperties =
            static_cast<uint32_t>(m_properties.size()) - instance.firstProperty;
        Known& known = KnownOf(name.ident);
        if (known.instanceEpoch == m_epoch)
            ThrowAtLine(instance.line, "there are two instances " + Quoted(name.ident));
        known.instanceEpoch = m_epoch;
        known.instance = static_cast<uint32_t>(m_instances.size());
        m_instances.push_back(instance);
    }

    // (property NAME (string "...")), (integer 6), (boolean (true)).
    void ReadProperty(EdifInstance& instance)
    {
        EdifProperty property;
        property.name = ReadName().text;
        bool isRead = false;
        while (NextPart("property")) {
            const bool isString = m_tokens.IsOpen("string");
            const bool isInteger = m_tokens.IsOpen("integer") || m_tokens.IsOpen("number");
            if (!isString && !isInteger) {
                m_tokens.Skip();
                continue;
            }
            m_tokens.Next();
            if (m_tokens.Kind() == EdifToken::Close)
                continue; // no value
            property.value.text = isString ? Decoded(m_tokens.Text()) : m_tokens.Text();
            property.value.isNumber = isInteger && ToNumber(property.value);
            m_tokens.Skip();
            Close("property");
            isRead = true;
        }
        if (isRead && property.name == m_job.options.keyAttribute)
            instance.key = m_job.design.names.Add(property.value.text);
        if (isRead)
            m_properties.push_back(property);
    }

    // A number of 64 bits; another one stays a text, which is then not an init value.
    static bool ToNumber(CellValue& value)
    {
        for (const char character : value.text) {
            const auto digit = static_cast<uint64_t>(character - '0');
            if (character < '0' || character > '9' || value.number > (UINT64_MAX - digit) / 10)
                return false;
            value.number = value.number * 10 + digit;
        }
        return !value.text.empty();
    }

    void ReadNet(uint32_t cell)
    {
        const EdifName name = ReadName();
        if (name.isArray)
            Refuse("an array of nets is not read: " + Quoted(name.ident));
        Known& known = KnownOf(name.ident);
        if (known.netEpoch == m_epoch)
            Refuse("there are two nets " + Quoted(name.ident));
        known.netEpoch = m_epoch;
        const LocalNet net = AddNet(name.text);
        while (NextPart("net")) {
            if (!m_tokens.IsOpen("joined")) {
                m_tokens.Skip();
                continue;
            }
            while (NextPart("joined")) {
                if (m_tokens.IsOpen("portRef"))
                    ReadPortRef(cell, net);
                else
                    m_tokens.Skip();
            }
        }
    }

    LocalNet AddNet(std::string_view name)
    {
        m_module->netNames.push_back(m_job.design.names.Add(name));
        m_module->isHidden.push_back(!name.empty() && name[0] == '$');
        return static_cast<LocalNet>(m_module->netNames.size() - 1);
    }

    // (portRef name (instanceRef instance)) and (portRef (member name index) ...).
    void ReadPortRef(uint32_t cell, LocalNet net)
    {
        EdifJoint joint = {kNone, 0, 0, net};
        uint64_t member = kNone;
        std::string_view port;
        m_tokens.Next();
        if (m_tokens.IsOpen("member")) {
            m_tokens.Next();
            port = CurrentName().ident;
            m_tokens.Next();
            member = Number(kMaxPortBits);
            Close("member");
        } else {
            port = CurrentName().ident;
        }
        while (NextPart("portRef")) {
            if (!m_tokens.IsOpen("instanceRef")) {
                m_tokens.Skip();
                continue;
            }
            const std::string_view ident = ReadName().ident;
            const Known& known = KnownOf(ident);
            if (known.instanceEpoch != m_epoch)
                Refuse("there is no instance " + Quoted(ident) + " before");
            joint.instance = known.instance;
            Close("instanceRef");
        }
        const EdifCell& owner =
            m_cells[joint.instance == kNone ? cell : m_instances[joint.instance].cell];
        joint.port = FindPort(owner, port);
        const uint32_t numBits = owner.ports[joint.port].numBits;
        const bool isVector = VectorType(owner, owner.ports[joint.port]) != nullptr;
        if (member != kNone && member >= numBits && !isVector)
            Refuse("port " + Quoted(port) + " has " + Count(numBits, "bit") + ", and no member " +
                   std::to_string(member));
        if (member == kNone && numBits != 1 && !isVector)
            Refuse("port " + Quoted(port) + " is an array; say which member");
        joint.member = member == kNone ? 0 : static_cast<uint32_t>(member);
        m_joints.push_back(joint);
    }

    // A cell has few ports; those of a large one are found by a map that is made once.
    uint32_t FindPort(const EdifCell& cell, std::string_view ident)
    {
        const NameId id = m_idents.Find(ident);
        if (cell.ports.size() > 16) {
            auto& ports = m_ports_of[static_cast<uint32_t>(&cell - m_cells.data())];
            for (auto port = static_cast<uint32_t>(ports.size()); port < cell.ports.size(); ++port)
                ports.emplace(cell.ports[port].ident, port);
            const auto found = ports.find(id);
            if (found != ports.end())
                return found->second;
        } else {
            for (uint32_t port = 0; port < cell.ports.size(); ++port)
                if (cell.ports[port].ident == id)
                    return port;
        }
        Refuse("cell " + Quoted(cell.typeText) + " has no port " + Quoted(ident));
    }

    // --- what a view makes

    // Each bit of a port is a net of its own where none is joined to it.
    void MakePorts(uint32_t cell)
    {
        std::vector<uint32_t> first;
        uint32_t numBits = 0;
        for (const EdifPort& port : m_cells[cell].ports) {
            first.push_back(numBits);
            numBits += port.numBits;
            if (numBits > kMaxPortBits * 16)
                Refuse("the ports of the cell have too many bits");
        }
        std::vector<LocalNet> nets(numBits, 0);
        for (const EdifJoint& joint : m_joints) {
            if (joint.instance != kNone)
                continue;
            LocalNet& net =
                nets[first[joint.port] + BitOf(joint, m_cells[cell].ports[joint.port].numBits)];
            if (net == 0)
                net = joint.net;
            else
                m_module->joins.emplace_back(net, joint.net);
        }
        for (size_t index = 0; index < first.size(); ++index) {
            const EdifPort& port = m_cells[cell].ports[index];
            ModulePort made;
            made.bits = {port.name, static_cast<uint32_t>(m_module->bits.size()), port.numBits};
            made.direction = port.direction;
            for (uint32_t bit = 0; bit < port.numBits; ++bit)
                m_module->bits.push_back(PortNet(port, bit, nets[first[index] + bit]));
            m_module->ports.push_back(made);
        }
    }

    LocalNet PortNet(const EdifPort& port, uint32_t bit, LocalNet joined)
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

    static uint32_t BitOf(const EdifJoint& joint, uint32_t numBits)
    {
        assert(joint.member < numBits);
        return numBits - 1 - joint.member;
    }

    // Sorted by instance, then by port and bit, which are the pins of its cell in order.
    void MakeCells()
    {
        std::vector<uint32_t> starts(m_instances.size() + 1, 0);
        for (const EdifJoint& joint : m_joints)
            if (joint.instance != kNone)
                ++starts[joint.instance + 1];
        for (size_t instance = 0; instance < m_instances.size(); ++instance)
            starts[instance + 1] += starts[instance];
        std::vector<EdifJoint> sorted(starts.back());
        std::vector<uint32_t> places(starts.begin(), starts.end() - 1);
        for (const EdifJoint& joint : m_joints)
            if (joint.instance != kNone)
                sorted[places[joint.instance]++] = joint;
        for (size_t instance = 0; instance < m_instances.size(); ++instance)
            MakeCell(m_instances[instance], sorted.data() + starts[instance],
                     sorted.data() + starts[instance + 1]);
    }

    void MakeCell(const EdifInstance& instance, EdifJoint* first, EdifJoint* last)
    {
        if (m_pace.IsDue())
            m_pace.Report(m_tokens.Position());
        std::sort(first, last, [](const EdifJoint& left, const EdifJoint& right) {
            return left.port != right.port ? left.port < right.port : left.member > right.member;
        });
        const EdifCell& cell = m_cells[instance.cell];
        m_intake.Begin(instance.name, instance.line);
        m_intake.SetKey(instance.key);
        m_intake.SetType(m_job.cellTypes.Find(std::string(cell.typeText)) != nullptr
                             ? cell.typeText
                             : m_job.design.names.Text(cell.type));
        for (uint32_t property = 0; property < instance.numProperties; ++property) {
            const EdifProperty& own = m_properties[instance.firstProperty + property];
            m_intake.AddParameter(own.name, own.value);
        }
        while (first != last) {
            EdifJoint* end = first;
            while (end != last && end->port == first->port)
                ++end;
            AddPin(instance, first, end);
            first = end;
        }
        m_intake.End();
    }

    // The joints of one port, the last member first.
    void AddPin(const EdifInstance& instance, const EdifJoint* first, const EdifJoint* last)
    {
        const EdifCell& cell = m_cells[instance.cell];
        const EdifPort& port = cell.ports[first->port];
        const CellType* vector = VectorType(cell, port);
        const uint32_t numBits = vector == nullptr
                                     ? port.numBits
                                     : std::max(first->member + 1, OwnWidth(instance, *vector));
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

    // The type of a cell whose port has any number of bits, else null. Yosys has one cell $lut for
    // all of them, with the bits of one: an instance says its own width, and members count from it.
    const CellType* VectorType(const EdifCell& cell, const EdifPort& port) const
    {
        const std::vector<uint32_t>* variants = m_job.cellTypes.Find(std::string(cell.typeText));
        if (variants == nullptr)
            return nullptr;
        const CellType& type = m_job.cellTypes.All()[variants->front()];
        return !type.vectorPin.empty() && type.vectorPin == m_job.design.names.Text(port.name)
                   ? &type
                   : nullptr;
    }

    // 0 where the instance does not say it: as many as are joined.
    uint32_t OwnWidth(const EdifInstance& instance, const CellType& type) const
    {
        for (uint32_t property = 0; property < instance.numProperties; ++property) {
            const EdifProperty& own = m_properties[instance.firstProperty + property];
            if (own.name == type.widthParameter && own.value.isNumber &&
                own.value.number <= kMaxPortBits)
                return static_cast<uint32_t>(own.value.number);
        }
        return 0;
    }

    // What an identifier means in the view that is read.
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
    Pace m_pace;
    CellIntake m_intake;
    EdifTokens m_tokens;
    std::string m_buffer;
    std::deque<std::string> m_strings;

    NameArena m_idents; // names of the file's own, apart from those of the design
    NameId m_library = 0;
    std::vector<EdifCell> m_cells;
    std::unordered_map<uint64_t, uint32_t> m_cell_numbers; // by library and identifier
    std::unordered_map<NameId, uint32_t> m_last_with;      // by identifier
    std::unordered_map<NameId, bool> m_module_names;
    std::unordered_map<uint32_t, std::unordered_map<NameId, uint32_t>> m_ports_of;

    ModuleContent* m_module = nullptr;
    uint32_t m_epoch = 0; // of the view
    std::vector<Known> m_known;
    std::vector<EdifInstance> m_instances;
    std::vector<EdifProperty> m_properties;
    std::vector<EdifJoint> m_joints;
    std::vector<LocalNet> m_pin_nets;
};

} // namespace

void ReadEdif(const ReadJob& job)
{
    EdifReader(job).Read();
}

} // namespace booleq
