// Reads files of gates of the form BLIF: as much of it as the writer uses, one model, one output.
// Fails: false, 'network' is as it was.  Cost: in step with the text.
#include <sstream>

#include "network_builder.h"

namespace booleq {

namespace {

class BlifReader {
  public:
    // Fails: false, also for a text without an end.
    bool Read(const std::string& text)
    {
        std::istringstream lines(text);
        for (std::string line; !m_is_at_end && std::getline(lines, line);) {
            m_words = SplitWords(line);
            if (!m_words.empty() && m_words[0][0] != '#' && !ReadLine())
                return false;
        }
        return m_is_at_end;
    }

    bool Take(Network& network) { return m_builder.Take(m_output, network); }

  private:
    struct Directive {
        const char* word;
        bool (BlifReader::*read)();
    };

    bool ReadLine()
    {
        static constexpr Directive kDirectives[] = {{".model", &BlifReader::ReadModel},
                                                    {".inputs", &BlifReader::ReadInputs},
                                                    {".outputs", &BlifReader::ReadOutputs},
                                                    {".names", &BlifReader::ReadNames},
                                                    {".end", &BlifReader::ReadEnd}};
        if (m_words[0][0] != '.')
            return ReadRow();
        EndTable();
        for (const Directive& directive : kDirectives)
            if (m_words[0] == directive.word)
                return (this->*directive.read)();
        return false;
    }

    bool ReadModel() { return true; }

    bool ReadInputs()
    {
        for (size_t word = 1; word < m_words.size(); ++word)
            if (!m_builder.AddInput(m_words[word]))
                return false;
        return true;
    }

    bool ReadOutputs()
    {
        if (m_words.size() != 2)
            return false;
        m_output = m_words[1];
        return true;
    }

    // Opens the table of the signal that is named last.
    bool ReadNames()
    {
        if (m_words.size() < 2)
            return false;
        m_operands.assign(m_words.size() - 2, 0);
        for (size_t operand = 0; operand < m_operands.size(); ++operand)
            if (!m_builder.Find(m_words[operand + 1], m_operands[operand]))
                return false;
        m_is_in_table = true;
        return m_builder.AddSignal(m_words.back());
    }

    bool ReadRow()
    {
        return m_is_in_table && m_words.size() <= 2 && m_words.back() == "1" &&
               m_table.Add(m_words.size() == 2 ? m_words[0] : std::string(), m_operands);
    }

    bool ReadEnd()
    {
        m_is_at_end = true;
        return true;
    }

    void EndTable()
    {
        if (m_is_in_table)
            m_builder.DefineLast(m_table.Take());
        m_is_in_table = false;
    }

    NetworkBuilder m_builder;
    TableRows m_table;
    std::vector<std::string> m_words; // of the line
    std::vector<uint32_t> m_operands; // of the table
    std::string m_output;
    bool m_is_in_table = false;
    bool m_is_at_end = false;
};

} // namespace

bool ReadBlif(const std::string& text, Network& network)
{
    BlifReader reader;
    return reader.Read(text) && reader.Take(network);
}

} // namespace booleq
