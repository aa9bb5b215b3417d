// Reads the JSON that Yosys writes (write_json): modules with ports, cells and names of nets. A bit
// of a net is a number within its module, or "0", "1", "x", "z".
#include <cassert>
#include <unordered_map>

#include "cell_intake.h"
#include "json_values.h"
#include "read_fault.h"
#include "readers.h"

namespace booleq {

namespace {

class JsonReader {
  public:
    explicit JsonReader(const ReadJob& job)
        : m_job(job), m_pace(job), m_intake(job.design, job.cellTypes, BareDigits::Binary),
          m_bit_numbers(job.source.Text().size())
    {
    }

    void Read()
    {
        const std::string_view text = m_job.source.Text();
        try {
            m_document = m_parser.iterate(
                simdjson::padded_string_view(text.data(), text.size(), m_job.source.Capacity()));
            m_has_document = true;
            bool hasModules = false;
            for (auto field : m_document.get_object()) {
                const std::string_view key = KeyOf(field);
                if (key != "modules")
                    continue;
                if (hasModules)
                    Refuse("'modules' is given twice");
                hasModules = true;
                ReadModules(field.value());
            }
            if (!hasModules)
                throw ReadFault{"the JSON text has no \"modules\"; was it written by write_json?"};
            const char* rest = nullptr; // the call fails at the end of the text
            if (m_document.current_location().get(rest) == simdjson::SUCCESS)
                Refuse("unexpected text after the last '}'");
        } catch (const simdjson::simdjson_error& error) {
            Refuse(ReasonOf(error.error()));
        }
    }

  private:
    // What is being read, for messages; the names are views into the file.
    struct Place {
        std::string_view module;
        const char* section = "";
        std::string_view item;
        std::string_view part;
    };

    // The position in bytes from the start; 0 if it is not known.
    size_t Location()
    {
        const char* location = nullptr;
        const std::string_view text = m_job.source.Text();
        if (!m_has_document || m_document.current_location().get(location) != simdjson::SUCCESS ||
            location < text.data() || location > text.data() + text.size())
            return 0;
        return static_cast<size_t>(location - text.data());
    }

    [[noreturn]] void Refuse(const std::string& what)
    {
        const size_t location = Location();
        std::vector<std::string> where;
        if (!m_place.module.empty())
            where.push_back("module " + Quoted(m_place.module));
        if (!m_place.item.empty())
            where.push_back(std::string(m_place.section) + " " + Quoted(m_place.item));
        if (!m_place.part.empty())
            where.push_back(Quoted(m_place.part));
        const std::string text = (where.empty() ? "" : Join(where, ", ") + ": ") + what;
        if (location != 0)
            ThrowAtLine(m_job.source.LineOf(location), text);
        throw ReadFault{text};
    }

    // Replaces the parser's words by words that help the reader of the message.
    static std::string ReasonOf(simdjson::error_code error)
    {
        switch (error) {
        case simdjson::INCORRECT_TYPE:
            return "the value is not of the type that write_json writes there";
        case simdjson::EMPTY:
        case simdjson::UNCLOSED_STRING:
        case simdjson::INCOMPLETE_ARRAY_OR_OBJECT:
            return "the JSON text is not whole";
        case simdjson::TAPE_ERROR:
            return "the JSON text is not well-formed";
        case simdjson::UTF8_ERROR:
            return "the JSON text is not UTF-8";
        case simdjson::DEPTH_ERROR:
            return "the JSON text is nested too deep";
        default: // the parser has more
            return simdjson::error_message(error);
        }
    }

    // Begins a section, in which AddOnce refuses a name that was there before.
    void EnterSection(const char* section)
    {
        m_place.section = section;
        m_place.item = m_place.part = std::string_view();
        ++m_section;
    }

    NameId AddOnce(std::string_view name)
    {
        m_place.item = name;
        const NameId id = m_job.design.names.Add(name);
        if (id >= m_section_of.size())
            m_section_of.resize(id + id / 2 + size_t(64), 0);
        if (m_section_of[id] == m_section)
            Refuse("the name is given twice");
        m_section_of[id] = m_section;
        const std::string_view own = WithoutMark(name);
        return own.size() == name.size() ? id : m_job.design.names.Add(own);
    }

    void ReadModules(json::value modules)
    {
        std::unordered_map<NameId, bool> names;
        for (auto field : modules.get_object()) {
            m_place = Place();
            m_place.module = KeyOf(field);
            m_job.modules.emplace_back();
            m_module = &m_job.modules.back();
            m_module->name = m_job.design.names.Add(m_place.module);
            if (!names.emplace(m_module->name, true).second)
                Refuse("the name is given twice");
            ReadModule(field.value());
        }
        m_place = Place();
    }

    void ReadModule(json::value module)
    {
        m_bit_numbers.Clear();
        m_intake.EnterModule(*m_module);
        bool hasCells = false;
        bool hasNets = false;
        bool hasPorts = false;
        const auto once = [this](bool& isThere, const char* section) {
            EnterSection(section);
            if (isThere)
                Refuse("the section is given twice");
            isThere = true;
        };
        for (auto field : module.get_object()) {
            const std::string_view key = KeyOf(field);
            if (key == "attributes") {
                ReadModuleAttributes(field.value());
            } else if (key == "ports") {
                once(hasPorts, "port");
                ReadPorts(field.value());
            } else if (key == "cells") {
                once(hasCells, "cell");
                ReadCells(field.value());
            } else if (key == "netnames") {
                once(hasNets, "net");
                ReadNets(field.value());
            }
        }
        NameTheRest();
    }

    void ReadModuleAttributes(json::value attributes)
    {
        for (auto field : attributes.get_object()) {
            const std::string_view key = KeyOf(field);
            if (key == "top")
                m_module->isTop = IsSet(field.value());
            else if (key == "blackbox" || key == "whitebox")
                m_module->isBlackBox |= IsSet(field.value());
        }
    }

    LocalNet NetOf(uint64_t bit)
    {
        LocalNet& net = m_bit_numbers.At(bit);
        if (net == 0) {
            net = static_cast<LocalNet>(m_module->netNames.size());
            m_module->netNames.push_back(0);
            m_module->isHidden.push_back(true);
        }
        return net;
    }

    LocalNet ConstantOf(std::string_view text)
    {
        if (text == "0")
            return kNetZero;
        if (text == "1")
            return kNetOne;
        if (text != "x" && text != "z")
            Refuse("a bit is a number from 0 on, \"0\", \"1\", \"x\" or \"z\", not " +
                   Quoted(text));
        return kNetUnknown;
    }

    // Reads the bits into m_bits.
    void ReadBits(json::value bits)
    {
        m_bits.clear();
        for (auto element : bits.get_array()) {
            json::value bit = element.value();
            uint64_t number = 0;
            std::string_view text;
            if (bit.get_uint64().get(number) == simdjson::SUCCESS)
                m_bits.push_back(NetOf(number));
            else
                m_bits.push_back(ConstantOf(GetString(bit, text) ? text : Token(bit)));
        }
    }

    void ReadPorts(json::value ports)
    {
        for (auto field : ports.get_object()) {
            ModulePort port;
            port.bits.name = AddOnce(KeyOf(field));
            bool hasBits = false;
            for (auto part : field.value().get_object()) {
                m_place.part = KeyOf(part);
                if (m_place.part == "direction")
                    port.direction = DirectionOf(StringOf(part.value()));
                if (m_place.part != "bits" || hasBits)
                    continue;
                hasBits = true;
                ReadBits(part.value());
                port.bits.first = static_cast<uint32_t>(m_module->bits.size());
                port.bits.count = static_cast<uint32_t>(m_bits.size());
                m_module->bits.insert(m_module->bits.end(), m_bits.begin(), m_bits.end());
            }
            m_place.part = std::string_view();
            m_module->ports.push_back(port);
        }
    }

    void ReadCells(json::value cells)
    {
        for (auto field : cells.get_object()) {
            const std::string_view name = KeyOf(field);
            if (m_pace.IsDue())
                m_pace.Report(Location());
            m_intake.Begin(AddOnce(name), 0);
            for (auto part : field.value().get_object()) {
                m_place.part = KeyOf(part);
                ReadCellPart(part.value());
            }
            m_place.part = std::string_view();
            m_intake.End();
        }
    }

    void ReadCellPart(json::value part)
    {
        const std::string_view key = m_place.part;
        if (key == "type")
            m_intake.SetType(StringOf(part));
        else if (key == "parameters")
            ReadParameters(part);
        else if (key == "attributes" && !m_job.options.keyAttribute.empty())
            ReadKey(part);
        else if (key == "connections")
            ReadConnections(part);
    }

    void ReadParameters(json::value parameters)
    {
        for (auto field : parameters.get_object()) {
            const std::string_view name = KeyOf(field);
            json::value own = field.value();
            CellValue value;
            if (GetString(own, value.text)) {
                m_intake.AddParameter(name, value);
                continue;
            }
            value.isNumber = own.get_uint64().get(value.number) == simdjson::SUCCESS;
            if (!value.isNumber)
                value.text = Token(own);
            m_intake.AddParameter(name, value);
        }
    }

    void ReadKey(json::value attributes)
    {
        for (auto field : attributes.get_object()) {
            if (KeyOf(field) != m_job.options.keyAttribute)
                continue;
            json::value own = field.value();
            std::string_view text;
            if (!GetString(own, text))
                text = Token(own);
            m_intake.SetKey(m_job.design.names.Add(text));
        }
    }

    void ReadConnections(json::value connections)
    {
        for (auto field : connections.get_object()) {
            m_place.part = KeyOf(field);
            ReadBits(field.value());
            m_intake.AddPin(m_place.part, m_bits.data(), m_bits.size());
        }
    }

    void ReadNets(json::value nets)
    {
        for (auto field : nets.get_object()) {
            const std::string_view name = KeyOf(field);
            if (m_pace.IsDue())
                m_pace.Report(Location());
            const NameId id = AddOnce(name);
            bool isHidden = false;
            bool isDownwards = false;
            int64_t offset = 0;
            m_bits.clear();
            for (auto part : field.value().get_object()) {
                m_place.part = KeyOf(part);
                if (m_place.part == "bits")
                    ReadBits(part.value());
                else if (m_place.part == "hide_name")
                    isHidden = IsSet(part.value());
                else if (m_place.part == "offset")
                    offset = part.value().get_int64();
                else if (m_place.part == "upto")
                    isDownwards = IsSet(part.value());
            }
            m_place.part = std::string_view();
            if (m_bits.size() == 1) {
                NameNet(m_bits[0], id, isHidden);
                continue;
            }
            for (size_t bit = 0; bit < m_bits.size(); ++bit) {
                const size_t step = isDownwards ? m_bits.size() - 1 - bit : bit;
                m_text.assign(WithoutMark(name));
                m_text += '[';
                m_text += std::to_string(static_cast<uint64_t>(offset) + step);
                m_text += ']';
                NameNet(m_bits[bit], m_job.design.names.Add(m_text), isHidden);
            }
        }
    }

    // A net gets its first name, but a public name replaces one that a tool made up.
    void NameNet(LocalNet net, NameId name, bool isHidden)
    {
        if (net == kNetUnknown)
            return;
        if (net >= kNumFixedNets) {
            NameId& own = m_module->netNames[net];
            if (own == 0 || (m_module->isHidden[net] && !isHidden)) {
                std::swap(own, name);
                m_module->isHidden[net] = isHidden;
            }
        }
        if (name != 0)
            m_module->aliases.push_back({net, name});
    }

    // Makes up names for nets that occur only in cells and ports.
    void NameTheRest()
    {
        for (size_t net = kNumFixedNets; net < m_module->netNames.size(); ++net)
            if (m_module->netNames[net] == 0)
                m_module->netNames[net] = m_job.design.names.Add("$unnamed" + std::to_string(net));
    }

    const ReadJob& m_job;
    Pace m_pace;
    json::parser m_parser;
    json::document m_document;
    bool m_has_document = false; // only then may it be asked for its location
    Place m_place;
    CellIntake m_intake;
    BitNumbers m_bit_numbers;
    ModuleContent* m_module = nullptr;
    std::vector<LocalNet> m_bits;
    std::string m_text;
    uint32_t m_section = 0;
    std::vector<uint32_t> m_section_of; // by name: the last section that had it
};

} // namespace

void ReadYosysJson(const ReadJob& job)
{
    JsonReader(job).Read();
}

} // namespace booleq
