#include "blif.h"

#include <algorithm>
#include <fstream>
#include <sstream>

namespace {

// Tables with more inputs are not look-up tables of a device, and their digits would fill memory.
constexpr size_t kMaxInputs = 16;

struct Row {
    std::string pattern; // a character 0, 1 or - for each input
    size_t line;
};

// A .names block as written: patterns of its on-set, or only of its off-set.
struct Block {
    size_t line = 0;
    std::vector<std::string> signals; // the output last
    std::vector<Row> rows;
    char value = '1'; // of the patterns
};

class Reader {
  public:
    explicit Reader(const std::string& path) : m_stream(path)
    {
        if (!m_stream)
            throw Fault(path + ": cannot be read");
        m_network.file = path;
    }

    Network Read()
    {
        std::vector<std::string> words;
        bool isEnded = false;
        while (!isEnded && ReadWords(words))
            isEnded = ReadLine(words);
        if (!m_has_model)
            Fail(m_network.file, std::max<size_t>(1, m_next_line - 1),
                 "there is no .model; is this a BLIF file?");
        CloseBlock();
        SortTables(m_network);
        for (const std::string& output : m_network.outputs)
            CheckDriven(output);
        return std::move(m_network);
    }

  private:
    [[noreturn]] void FailHere(const std::string& what) const
    {
        Fail(m_network.file, m_line, what);
    }

    // The words of the next line that has any; a '\' at its end continues it, '#' begins a comment.
    bool ReadWords(std::vector<std::string>& words)
    {
        words.clear();
        bool isContinued = false;
        for (std::string line; (words.empty() || isContinued) && std::getline(m_stream, line);
             ++m_next_line) {
            if (!isContinued)
                m_line = m_next_line;
            line.resize(std::min(line.size(), line.find('#')));
            const size_t end = line.find_last_not_of(" \t\r");
            isContinued = end != std::string::npos && line[end] == '\\';
            if (isContinued)
                line.erase(end);
            std::istringstream stream(line);
            for (std::string word; stream >> word;)
                words.push_back(word);
        }
        if (isContinued)
            FailHere("the file ends within a line that '\\' continues; it is cut off");
        return !words.empty();
    }

    // True at the end of the model.
    bool ReadLine(const std::vector<std::string>& words)
    {
        const std::string& word = words[0];
        if (word[0] != '.') {
            ReadRow(words);
            return false;
        }
        CloseBlock();
        if (word == ".model" && !m_has_model)
            m_has_model = true;
        else if (word == ".model")
            FailHere("a second model; flatten the design before it is written");
        else if (word == ".inputs" || word == ".outputs")
            AddNames(words, word == ".inputs" ? m_network.inputs : m_network.outputs);
        else if (word == ".names")
            OpenBlock(words);
        else if (word == ".latch")
            FailHere(".latch: only combinational networks can be checked; cut the registers out");
        else if (word == ".gate" || word == ".subckt")
            FailHere(word +
                     ": only .names blocks can be checked; map to look-up tables, flattened");
        else if (word != ".end")
            FailHere(word + " is not known; blocks are .model .inputs .outputs .names .end");
        return word == ".end";
    }

    std::string NameOf(const std::string& signal) const
    {
        if (signal.find('\'') != std::string::npos)
            FailHere(signal + ": a signal with a quote has no name in an equation; rename it");
        return ToName(signal);
    }

    void AddNames(const std::vector<std::string>& words, std::vector<std::string>& names) const
    {
        for (size_t place = 1; place < words.size(); ++place) {
            const std::string name = NameOf(words[place]);
            if (std::find(names.begin(), names.end(), name) != names.end())
                FailHere(words[0] + " lists " + name + " twice");
            names.push_back(name);
        }
    }

    void OpenBlock(const std::vector<std::string>& words)
    {
        m_block.line = m_line;
        AddNames(words, m_block.signals);
        if (m_block.signals.empty())
            FailHere(".names has no output; its last name is the output");
        if (m_block.signals.size() > kMaxInputs + 1)
            FailHere(m_block.signals.back() + " has " + std::to_string(m_block.signals.size() - 1) +
                     " inputs, more than " + std::to_string(kMaxInputs) +
                     "; map the design to look-up tables first");
    }

    void ReadRow(const std::vector<std::string>& words)
    {
        if (m_block.signals.empty())
            FailHere("'" + words[0] + "' stands outside of a .names block");
        const size_t numInputs = m_block.signals.size() - 1;
        const std::string pattern = numInputs == 0 ? std::string() : words[0];
        if (words.size() != (numInputs == 0 ? 1u : 2u))
            FailHere("a row of " + m_block.signals.back() + " has " + std::to_string(words.size()) +
                     " columns; it needs " +
                     (numInputs == 0 ? "the output's value alone" : "a pattern and a value"));
        if (pattern.size() != numInputs)
            FailHere("pattern '" + pattern + "' has " + std::to_string(pattern.size()) +
                     " characters, but " + m_block.signals.back() + " has " +
                     std::to_string(numInputs) + " inputs");
        const size_t foreign = pattern.find_first_not_of("01-");
        if (foreign != std::string::npos)
            FailHere("'" + pattern.substr(foreign, 1) + "' in pattern '" + pattern +
                     "' is none of 0, 1 and -");
        const std::string& value = words.back();
        if (value != "0" && value != "1")
            FailHere("value '" + value + "' of a row is neither 0 nor 1");
        if (!m_block.rows.empty() && value[0] != m_block.value)
            FailHere("a row for " + value + " among rows for " + std::string(1, m_block.value) +
                     "; a block lists either where it is 1 or where it is 0");
        m_block.value = value[0];
        m_block.rows.push_back({pattern, m_line});
    }

    void CloseBlock()
    {
        if (m_block.signals.empty())
            return;
        Table table;
        table.line = m_block.line;
        table.output = m_block.signals.back();
        table.inputs.assign(m_block.signals.begin(), m_block.signals.end() - 1);
        SetFromInitValue(table);
        m_network.tables.push_back(std::move(table));
        m_block = Block();
    }

    // The block's digits, row 2^n-1 first, are an init value, which the library reads.
    void SetFromInitValue(Table& table) const
    {
        const size_t numInputs = table.inputs.size();
        if (numInputs == 0) { // a constant has no init value
            const bool isOne = !m_block.rows.empty() && m_block.value == '1';
            table.equation.SetEquation(isOne ? "1" : "0");
        } else {
            std::string digits(size_t{1} << numInputs, m_block.value == '1' ? '0' : '1');
            for (const Row& row : m_block.rows)
                Cover(row.pattern, m_block.value, digits);
            std::reverse(digits.begin(), digits.end());
            const std::vector<KqString> inputs = ToPort(table.inputs);
            if (!table.equation.SetEquationWithExplicitTerms(inputs, ("0b" + digits).c_str(), false,
                                                             false))
                Fail(m_network.file, table.line,
                     table.output + ": the library refuses 0b" + digits);
        }
        table.equation.GetColumn(table.column);
    }

    // Writes 'value' into each row that the pattern covers.
    static void Cover(const std::string& pattern, char value, std::string& digits)
    {
        for (size_t row = 0; row < digits.size(); ++row) {
            bool isCovered = true;
            for (size_t place = 0; place < pattern.size(); ++place) {
                const bool isSet = (row >> (pattern.size() - 1 - place) & 1) != 0;
                isCovered = isCovered && pattern[place] != (isSet ? '0' : '1');
            }
            if (isCovered)
                digits[row] = value;
        }
    }

    static std::vector<KqString> ToPort(const std::vector<std::string>& names)
    {
        std::vector<KqString> found;
        found.reserve(names.size());
        for (const std::string& name : names)
            found.emplace_back(name.c_str());
        return found;
    }

    void CheckDriven(const std::string& output) const
    {
        const auto& tables = m_network.tables;
        const bool isDriven = std::any_of(tables.begin(), tables.end(), [&](const Table& table) {
            return table.output == output;
        });
        const auto& inputs = m_network.inputs;
        if (!isDriven && std::find(inputs.begin(), inputs.end(), output) == inputs.end())
            throw Fault(m_network.file + ": nothing drives the output " + output +
                        "; is the file cut off?");
    }

    std::ifstream m_stream;
    size_t m_line = 0; // where the last words read begin
    size_t m_next_line = 1;
    bool m_has_model = false;
    Block m_block;
    Network m_network;
};

} // namespace

Network ReadBlif(const std::string& path)
{
    return Reader(path).Read();
}
