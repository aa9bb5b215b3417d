// Reads tables of products: as much of the form PLA as the writer uses, named inputs and one
// output. Fails: false, 'network' is as it was.  Cost: in step with the text.
#include <sstream>

#include "network_builder.h"

namespace booleq {

namespace {

class PlaReader {
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

    bool Take(Network& network)
    {
        if (!m_builder.AddSignal(m_output))
            return false;
        m_builder.DefineLast(m_table.Take());
        return m_builder.Take(m_output, network);
    }

  private:
    struct Directive {
        const char* word;
        bool (PlaReader::*read)();
    };

    bool ReadLine()
    {
        static constexpr Directive kDirectives[] = {{".ilb", &PlaReader::ReadInputs},
                                                    {".ob", &PlaReader::ReadOutput},
                                                    {".e", &PlaReader::ReadEnd}};
        if (m_words[0][0] != '.')
            return ReadRow();
        for (const Directive& directive : kDirectives)
            if (m_words[0] == directive.word)
                return (this->*directive.read)();
        return true; // counts, which the rows show
    }

    bool ReadInputs()
    {
        for (size_t word = 1; word < m_words.size(); ++word) {
            m_inputs.push_back(static_cast<uint32_t>(m_builder.NumInputs()));
            if (!m_builder.AddInput(m_words[word]))
                return false;
        }
        return true;
    }

    bool ReadOutput()
    {
        if (m_words.size() != 2)
            return false;
        m_output = m_words[1];
        return true;
    }

    bool ReadRow()
    {
        if (m_words.size() != 2 || (m_words[1] != "0" && m_words[1] != "1"))
            return false;
        return m_words[1] == "0" || m_table.Add(m_words[0], m_inputs);
    }

    bool ReadEnd()
    {
        m_is_at_end = true;
        return true;
    }

    NetworkBuilder m_builder;
    TableRows m_table;
    std::vector<std::string> m_words; // of the line
    std::vector<uint32_t> m_inputs;
    std::string m_output;
    bool m_is_at_end = false;
};

} // namespace

bool ReadPla(const std::string& text, Network& network)
{
    PlaReader reader;
    return reader.Read(text) && reader.Take(network);
}

} // namespace booleq
