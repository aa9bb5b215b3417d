// Reads BLIF: models with .names, .subckt and .gate, each with .cname, .param and .attr after it.
// The first model is the top. Inputs of .names are pins from the least significant, as Yosys takes
// them.
#include <algorithm>
#include <cassert>
#include <unordered_set>

#include "cell_intake.h"
#include "read_fault.h"
#include "readers.h"

namespace booleq {

namespace {

bool IsBlank(char character)
{
    return character == ' ' || character == '\t' || character == '\r';
}

class BlifNetlistReader {
  public:
    explicit BlifNetlistReader(const ReadJob& job)
        : m_job(job), m_pace(job), m_intake(job.design, job.cellTypes, BareDigits::Binary),
          m_rest(job.source.Text())
    {
    }

    void Read()
    {
        while (NextLine()) {
            if (m_pace.IsDue())
                m_pace.Report(m_job.source.Text().size() - m_rest.size());
            if (m_words[0][0] != '.')
                ReadRow();
            else
                ReadDirective();
        }
        if (m_module != nullptr)
            ThrowAtLine(m_line, "the text ends inside model " +
                                    Quoted(m_job.design.names.Text(m_module->name)) +
                                    ", without .end");
    }

  private:
    enum class Open { Nothing, Names, Cell };
    enum class Rows01 { None, Ones, Zeros, Mixed };

    struct Directive {
        const char* word;
        size_t minWords;
        void (BlifNetlistReader::*read)();
    };

    [[noreturn]] void Refuse(const std::string& what) const { ThrowAtLine(m_start, what); }

    // The words of the next line that has any, together with those of the lines continued by '\'.
    // Deliberate: '#' begins a comment only at the start of a word, because names contain it, too.
    bool NextLine()
    {
        m_words.clear();
        while (!m_rest.empty()) {
            ++m_line;
            const size_t end = std::min(m_rest.find('\n'), m_rest.size());
            std::string_view line = m_rest.substr(0, end);
            m_rest.remove_prefix(std::min(end + 1, m_rest.size()));
            if (m_words.empty())
                m_start = m_line;
            while (!line.empty() && IsBlank(line.back()))
                line.remove_suffix(1);
            const bool isContinued = !line.empty() && line.back() == '\\';
            if (isContinued)
                line.remove_suffix(1);
            AddWords(line);
            if (!isContinued && !m_words.empty())
                return true;
        }
        return !m_words.empty();
    }

    void AddWords(std::string_view line)
    {
        size_t place = 0;
        while (place < line.size()) {
            if (IsBlank(line[place])) {
                ++place;
                continue;
            }
            if (line[place] == '#')
                return;
            const size_t start = place;
            while (place < line.size() && !IsBlank(line[place]))
                ++place;
            m_words.push_back(line.substr(start, place - start));
        }
    }

    void ReadDirective()
    {
        static constexpr Directive kDirectives[] = {
            {".names", 2, &BlifNetlistReader::ReadNames},
            {".subckt", 2, &BlifNetlistReader::ReadCell},
            {".gate", 2, &BlifNetlistReader::ReadCell},
            {".cname", 2, &BlifNetlistReader::ReadCellName},
            {".param", 3, &BlifNetlistReader::ReadParameter},
            {".attr", 3, &BlifNetlistReader::ReadAttribute},
            {".latch", 3, &BlifNetlistReader::ReadLatch},
            {".conn", 3, &BlifNetlistReader::ReadConnection},
            {".model", 1, &BlifNetlistReader::ReadModel},
            {".inputs", 1, &BlifNetlistReader::ReadInputs},
            {".outputs", 1, &BlifNetlistReader::ReadOutputs},
            {".clock", 1, &BlifNetlistReader::ReadInputs},
            {".blackbox", 1, &BlifNetlistReader::ReadBlackBox},
            {".exdc", 1, &BlifNetlistReader::SkipToEnd},
            {".end", 1, &BlifNetlistReader::ReadEnd}};
        for (const Directive& directive : kDirectives) {
            if (m_words[0] != directive.word)
                continue;
            if (m_words.size() < directive.minWords)
                Refuse(std::string(m_words[0]) + " needs more words");
            if (m_module == nullptr && directive.read != &BlifNetlistReader::ReadModel)
                Refuse(std::string(m_words[0]) + " comes before the first .model");
            (this->*directive.read)();
            return;
        }
        if (!IsAboutTiming(m_words[0]))
            Refuse(Quoted(m_words[0]) + " is not known");
        Flush();
    }

    // Directives that are only about times and loads.
    static bool IsAboutTiming(std::string_view word)
    {
        static constexpr const char* kWords[] = {".area",
                                                 ".delay",
                                                 ".wire_load_slope",
                                                 ".wire",
                                                 ".input_arrival",
                                                 ".default_input_arrival",
                                                 ".output_required",
                                                 ".default_output_required",
                                                 ".input_drive",
                                                 ".default_input_drive",
                                                 ".output_load",
                                                 ".default_output_load",
                                                 ".max_input_load",
                                                 ".default_max_input_load",
                                                 ".cycle",
                                                 ".clock_event",
                                                 ".no_merge"};
        return std::find(std::begin(kWords), std::end(kWords), word) != std::end(kWords);
    }

    // --- models

    void ReadModel()
    {
        if (m_module != nullptr)
            Refuse("the previous model has no .end");
        m_job.modules.emplace_back();
        m_module = &m_job.modules.back();
        m_intake.EnterModule(*m_module);
        ++m_epoch;
        m_module->name = m_words.size() > 1 ? m_job.design.names.Add(m_words[1]) : 0;
        if (!m_model_names.insert(m_module->name).second)
            Refuse("there are two models " + Quoted(m_words.size() > 1 ? m_words[1] : ""));
    }

    void ReadInputs() { ReadPorts(PortDirection::Input); }
    void ReadOutputs() { ReadPorts(PortDirection::Output); }

    void ReadPorts(PortDirection direction)
    {
        Flush();
        for (size_t word = 1; word < m_words.size(); ++word) {
            ModulePort port;
            port.bits.name = m_job.design.names.Add(WithoutMark(m_words[word]));
            port.bits.first = static_cast<uint32_t>(m_module->bits.size());
            port.bits.count = 1;
            port.direction = direction;
            m_module->bits.push_back(NetOf(m_words[word]));
            m_module->ports.push_back(port);
        }
    }

    void ReadBlackBox() { m_module->isBlackBox = true; }

    // External don't-cares (.exdc) say nothing about the tables.
    void SkipToEnd()
    {
        Flush();
        while (NextLine())
            if (m_words[0] == ".end") {
                ReadEnd();
                return;
            }
    }

    void ReadEnd()
    {
        Flush();
        m_module = nullptr;
    }

    // --- nets

    LocalNet NetOf(std::string_view name)
    {
        name = WithoutMark(name);
        const NameId id = m_job.design.names.Add(name);
        if (id >= m_nets.size())
            m_nets.resize(id + id / 2 + size_t(64), {0, 0});
        KnownNet& known = m_nets[id];
        if (known.epoch != m_epoch) {
            known.epoch = m_epoch;
            known.net = static_cast<LocalNet>(m_module->netNames.size());
            m_module->netNames.push_back(id);
            m_module->isHidden.push_back(!name.empty() && name[0] == '$');
        }
        return known.net;
    }

    // Two names of one net. There is no table here: other formats connect nets the same way.
    void ReadConnection()
    {
        Flush();
        if (m_words.size() != 3)
            Refuse(".conn has two nets");
        const LocalNet from = NetOf(m_words[1]);
        Connect(from, NetOf(m_words[2]));
    }

    // Deliberate: a buffer without a name is how BLIF says that two signals are one, and a netlist
    // in another format has no cell there.
    void Connect(LocalNet from, LocalNet to)
    {
        if (from != kNetUnknown && to != kNetUnknown)
            m_module->joins.emplace_back(from, to);
    }

    // --- tables

    void ReadNames()
    {
        Flush();
        m_open = Open::Names;
        m_intake.Begin(0, m_start);
        m_intake.SetType(".names");
        m_inputs.clear();
        for (size_t word = 1; word + 1 < m_words.size(); ++word)
            m_inputs.push_back(NetOf(m_words[word]));
        m_output_name = m_words.back();
        m_rows_are = Rows01::None;
        m_num_pins = static_cast<unsigned int>(std::min<size_t>(m_inputs.size(), UINT32_MAX));
        m_is_named = m_is_wire = false;
        m_num_rows = 0;
        if (m_num_pins <= kMaxTableInputs)
            m_words_of_rows.assign(NumWords(m_num_pins), 0);
    }

    void ReadRow()
    {
        if (m_open != Open::Names)
            Refuse("expected a directive such as .names instead of " + Quoted(m_words[0]));
        const std::string_view pattern = m_num_pins == 0 ? std::string_view() : m_words[0];
        const std::string_view value = m_words.back();
        if (m_words.size() != (m_num_pins == 0 ? 1u : 2u) || pattern.size() != m_num_pins)
            Refuse("a row of this table has " + Count(m_num_pins, "input") + " and a value");
        if (value != "0" && value != "1")
            Refuse("the value of a row is 0 or 1, not " + Quoted(value));
        if (pattern.find_first_not_of("01-") != std::string_view::npos)
            Refuse("expected 0, 1 or -, not " + Quoted(pattern));
        ++m_num_rows;
        m_is_wire = pattern == "1" && value == "1";
        const Rows01 kind = value == "1" ? Rows01::Ones : Rows01::Zeros;
        m_rows_are = m_rows_are == Rows01::None || m_rows_are == kind ? kind : Rows01::Mixed;
        if (m_num_pins <= kMaxTableInputs)
            AddProduct(pattern);
    }

    void AddProduct(std::string_view pattern)
    {
        const size_t numLow = std::min<size_t>(pattern.size(), 6);
        uint64_t low = ~uint64_t(0);
        for (size_t pin = 0; pin < numLow; ++pin)
            if (pattern[pin] != '-')
                low &= pattern[pin] == '1' ? BitPattern(pin) : ~BitPattern(pin);
        size_t care = 0; // bits of a word's number
        size_t value = 0;
        for (size_t pin = 6; pin < pattern.size(); ++pin) {
            care |= size_t(pattern[pin] != '-') << (pin - 6);
            value |= size_t(pattern[pin] == '1') << (pin - 6);
        }
        for (size_t word = 0; word < m_words_of_rows.size(); ++word)
            if ((word & care) == value)
                m_words_of_rows[word] |= low;
    }

    void FlushNames()
    {
        if (m_num_pins == 0 && m_rows_are != Rows01::Mixed) {
            FlushConstant();
            return;
        }
        if (m_num_pins == 1 && m_num_rows == 1 && m_is_wire && !m_is_named) {
            const LocalNet joined = NetOf(m_output_name);
            Connect(m_inputs[0], joined);
            AddNote(FindingCode::Buffer, joined,
                    "only passes " + NameOf(m_inputs[0]) + "; the two nets are one");
            return;
        }
        const LocalNet output = NetOf(m_output_name);
        if (m_num_pins > kMaxTableInputs || m_rows_are == Rows01::Mixed) {
            const bool isWide = m_num_pins > kMaxTableInputs;
            if (!m_is_named)
                m_intake.SetName(m_module->netNames[output]);
            m_intake.EndUnread(isWide ? FindingCode::TooWide : FindingCode::CoverMixed,
                               isWide ? Count(m_num_pins, "input") : "");
            return;
        }
        for (uint64_t& word : m_words_of_rows) {
            if (m_rows_are == Rows01::Zeros)
                word = ~word;
            word &= RowMask(m_num_pins);
        }
        m_intake.EndWithRows(booleq::Rows(m_num_pins, m_words_of_rows), m_inputs, output);
    }

    // Deliberate: a signal without inputs is a constant, as Yosys reads it, not a table.
    void FlushConstant()
    {
        if (m_output_name == "$undef" && m_rows_are == Rows01::None) {
            NetOf(m_output_name);
            m_nets[m_job.design.names.Find(m_output_name)].net = kNetUnknown;
            return;
        }
        const LocalNet output = NetOf(m_output_name);
        if (output == kNetUnknown)
            return;
        const bool isOne = m_rows_are == Rows01::Ones;
        m_module->joins.emplace_back(isOne ? kNetOne : kNetZero, output);
        if (m_output_name != (isOne ? "$true" : "$false")) // these names only spell a constant
            AddNote(FindingCode::ConstantNet, output, isOne ? "always 1" : "always 0");
    }

    std::string NameOf(LocalNet net) const
    {
        return net < kNumFixedNets ? std::string("1'bx")
                                   : std::string(m_job.design.names.Text(m_module->netNames[net]));
    }

    // A finding about a .names that does not become a table.
    void AddNote(FindingCode code, LocalNet output, const std::string& text)
    {
        if (output < kNumFixedNets)
            return;
        ReadFinding finding;
        finding.code = code;
        finding.line = m_intake.Line();
        finding.name = {0, m_module->netNames[output]};
        finding.text = text;
        m_module->findings.push_back(std::move(finding));
    }

    // --- cells

    void ReadCell()
    {
        Flush();
        m_open = Open::Cell;
        m_intake.Begin(0, m_start);
        m_intake.SetType(m_words[1]);
        for (size_t word = 2; word < m_words.size(); ++word) {
            const size_t sign = m_words[word].find('=');
            if (sign == 0 || sign == std::string_view::npos)
                Refuse("expected PIN=NET instead of " + Quoted(m_words[word]));
            const std::string_view actual = m_words[word].substr(sign + 1);
            if (actual.empty()) {
                m_intake.AddPin(m_words[word].substr(0, sign), nullptr, 0);
                continue;
            }
            const LocalNet net = NetOf(actual);
            m_intake.AddPin(m_words[word].substr(0, sign), &net, 1);
        }
    }

    void ReadLatch()
    {
        Flush();
        m_open = Open::Cell;
        m_intake.Begin(0, m_start);
        m_intake.SetType(".latch");
        const LocalNet input = NetOf(m_words[1]);
        const LocalNet output = NetOf(m_words[2]);
        m_intake.AddPin("D", &input, 1);
        m_intake.AddPin("Q", &output, 1);
    }

    void RequireOpen() const
    {
        if (m_open == Open::Nothing)
            Refuse(std::string(m_words[0]) + " comes before the first cell");
    }

    void ReadCellName()
    {
        RequireOpen();
        m_intake.SetName(m_job.design.names.Add(WithoutMark(m_words[1])));
        m_is_named = true;
    }

    // The text from this word to the end of the line, without enclosing quotation marks.
    std::string_view TextFrom(size_t word) const
    {
        const char* first = m_words[word].data();
        const char* last = m_words.back().data() + m_words.back().size();
        std::string_view text(first, static_cast<size_t>(last - first));
        if (text.size() >= 2 && text.front() == '"' && text.back() == '"')
            text = text.substr(1, text.size() - 2);
        return text;
    }

    void ReadParameter()
    {
        RequireOpen();
        CellValue value;
        value.text = TextFrom(2);
        m_intake.AddParameter(m_words[1], value);
    }

    void ReadAttribute()
    {
        RequireOpen();
        if (!m_job.options.keyAttribute.empty() && m_words[1] == m_job.options.keyAttribute)
            m_intake.SetKey(m_job.design.names.Add(TextFrom(2)));
    }

    // Completes the table or cell that is open.
    void Flush()
    {
        const Open open = m_open;
        m_open = Open::Nothing;
        if (open == Open::Names)
            FlushNames();
        else if (open == Open::Cell)
            m_intake.End();
    }

    struct KnownNet {
        uint32_t epoch;
        LocalNet net;
    };

    const ReadJob& m_job;
    Pace m_pace;
    CellIntake m_intake;
    std::string_view m_rest;
    std::vector<std::string_view> m_words; // of the current line
    uint32_t m_line = 0;
    uint32_t m_start = 0; // the line where m_words begins
    std::unordered_set<NameId> m_model_names;
    ModuleContent* m_module = nullptr;
    std::vector<KnownNet> m_nets; // by name
    uint32_t m_epoch = 0;         // of the model
    Open m_open = Open::Nothing;
    std::vector<LocalNet> m_inputs;
    std::string_view m_output_name;
    std::vector<uint64_t> m_words_of_rows;
    unsigned int m_num_pins = 0;
    Rows01 m_rows_are = Rows01::None;
    uint64_t m_num_rows = 0;
    bool m_is_named = false;
    bool m_is_wire = false; // its last row says that the output is the input
};

} // namespace

void ReadBlifNetlist(const ReadJob& job)
{
    BlifNetlistReader(job).Read();
}

} // namespace booleq
