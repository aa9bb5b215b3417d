// Reads PLA files. Rows may extend over several lines and directives may come in any order, as long
// as .i and .o come before the first row; so only the end of a row shows whether its width was
// right.
#include <algorithm>
#include <unordered_set>

#include "pla.h"

namespace booleq {

namespace {

const char* const kDirectives = ".i .o .ilb .ob .p .type .e .end";

std::vector<std::string> WordsOf(const char* begin, const char* end)
{
    std::vector<std::string> words;
    const auto isBlank = [](char c) { return c == ' ' || c == '\t' || c == '\r'; };
    while (begin != end) {
        if (isBlank(*begin)) {
            ++begin;
            continue;
        }
        const char* wordEnd = std::find_if(begin, end, isBlank);
        words.emplace_back(begin, wordEnd);
        begin = wordEnd;
    }
    return words;
}

// A piece of the text as a message shows it.
std::string Shown(const std::string& text)
{
    std::string shown;
    for (const char c : text.substr(0, 40))
        shown += c >= ' ' && c <= '~' ? c : '?';
    return "'" + shown + (text.size() > 40 ? "..." : "") + "'";
}

std::string Counted(size_t count, const char* what)
{
    return std::to_string(count) + " " + what + (count == 1 ? "" : "s");
}

class PlaReader {
  public:
    PlaReader(const std::string& text, Pla& pla, PlaFault& fault)
        : m_text(text), m_pla(pla), m_fault(fault)
    {
    }

    bool Read()
    {
        const char* begin = m_text.data();
        const char* const textEnd = begin + m_text.size();
        while (begin != textEnd && !m_is_ended) {
            ++m_line;
            const char* const lineEnd = std::find(begin, textEnd, '\n');
            if (!ReadLine(begin, std::find(begin, lineEnd, '#')))
                return false;
            begin = lineEnd == textEnd ? textEnd : lineEnd + 1;
        }
        return Finish();
    }

  private:
    bool Fail(size_t line, const std::string& message, const std::string& hint = "")
    {
        m_fault = {line, message, hint};
        return false;
    }

    bool ReadLine(const char* begin, const char* end)
    {
        while (begin != end && (*begin == ' ' || *begin == '\t' || *begin == '\r'))
            ++begin;
        while (begin != end && (end[-1] == ' ' || end[-1] == '\t' || end[-1] == '\r'))
            --end;
        if (begin == end)
            return true;
        if (*begin == '.')
            return IsRowWhole() && ReadDirective(WordsOf(begin, end));
        if (m_has_inputs && m_has_outputs)
            return ReadDigits(begin, end);
        // A title may come before everything else; what looks like a row comes too early.
        if (std::all_of(begin, end, [](char c) { return IsRowCharacter(c); }))
            return Fail(m_line, "a row before " + std::string(m_has_inputs ? ".o" : ".i"),
                        "write .i and .o, the numbers of inputs and outputs, before the first row");
        if (m_has_inputs || m_has_outputs)
            return Fail(m_line, "neither a directive nor a row: " + Shown(std::string(begin, end)),
                        "write comments after '#'");
        return true;
    }

    static bool IsRowCharacter(char c)
    {
        return std::string("01-~234xX| \t\r").find(c) != std::string::npos;
    }

    bool IsRowWhole()
    {
        if (m_num_digits == 0)
            return true;
        return Fail(m_row_line,
                    "the row has " + Counted(m_num_digits, "digit") + ", not " + RowWidth());
    }

    std::string RowWidth() const
    {
        return std::to_string(m_num_inputs + m_num_outputs) + " (" +
               Counted(m_num_inputs, "input") + " and " + Counted(m_num_outputs, "output") + ")";
    }

    bool ReadDirective(const std::vector<std::string>& words)
    {
        const std::string& name = words[0];
        if (name == ".e" || name == ".end") {
            m_is_ended = true;
            return true;
        }
        if (name == ".i")
            return ReadCount(words, kMaxPlaInputs, m_has_inputs, m_num_inputs);
        if (name == ".o")
            return ReadCount(words, kMaxPlaOutputs, m_has_outputs, m_num_outputs);
        if (name == ".p")
            return true; // rows are counted; the number given is ignored
        if (name == ".type")
            return ReadType(words);
        if (name == ".ilb")
            return ReadNames(words, "input", m_input_names_line, m_pla.inputs);
        if (name == ".ob")
            return ReadNames(words, "output", m_output_names_line, m_pla.outputs);
        return Fail(m_line, "unknown directive " + Shown(name),
                    std::string("known ones are ") + kDirectives);
    }

    bool ReadCount(const std::vector<std::string>& words, size_t most, bool& isKnown, size_t& count)
    {
        const bool isNumber = words.size() == 2 && !words[1].empty() && words[1].size() <= 6 &&
                              words[1].find_first_not_of("0123456789") == std::string::npos;
        if (!isNumber)
            return Fail(m_line, words[0] + " needs one number",
                        "write for example '" + words[0] + " 4'");
        const size_t value = std::stoul(words[1]);
        if (value > most || (value == 0 && words[0] == ".o"))
            return Fail(m_line, words[0] + " " + words[1] + ": from " +
                                    (words[0] == ".o" ? "1" : "0") + " to " + std::to_string(most) +
                                    " are accepted");
        if (isKnown && value != count)
            return Fail(m_line, words[0] + " is " + words[1] + " here and was " +
                                    std::to_string(count) + " before");
        isKnown = true;
        count = value;
        if (m_has_inputs && m_has_outputs)
            Begin();
        return true;
    }

    void Begin()
    {
        if (m_row.size() == m_pla.space.NumWords() * 3 && !m_row.empty())
            return; // the same numbers again
        m_pla.space = CubeSpace(m_num_inputs, m_num_outputs);
        const size_t numWords = m_pla.space.NumWords();
        m_pla.on = m_pla.free = m_pla.off = CubeList(numWords);
        m_row.assign(3 * numWords, 0);
    }

    bool ReadType(const std::vector<std::string>& words)
    {
        const std::string type = words.size() == 2 ? words[1] : "";
        if (type == "f")
            m_pla.type = PlaType::F;
        else if (type == "fd")
            m_pla.type = PlaType::Fd;
        else if (type == "fr")
            m_pla.type = PlaType::Fr;
        else if (type == "fdr")
            m_pla.type = PlaType::Fdr;
        else
            return Fail(m_line, ".type needs one of f, fd, fr, fdr");
        return true;
    }

    bool ReadNames(const std::vector<std::string>& words, const char* what, size_t& line,
                   std::vector<std::string>& names)
    {
        line = m_line;
        names.assign(words.begin() + 1, words.end());
        std::unordered_set<std::string> seen;
        for (const std::string& name : names)
            if (!seen.insert(name).second)
                return Fail(m_line,
                            "the " + std::string(what) + " " + Shown(name) + " is named twice",
                            "give each its own name");
        return true;
    }

    bool ReadDigits(const char* begin, const char* end)
    {
        const bool isAtStart = m_num_digits == 0;
        const size_t width = m_num_inputs + m_num_outputs;
        const char* blank = nullptr; // the last one; used if the line has no other run of blanks
        size_t numBlanks = 0;
        size_t digitsBeforeBlank = 0;
        if (isAtStart)
            m_row_line = m_line;
        bool isAfterRow = false;
        for (const char* place = begin; place != end; ++place) {
            if (*place == ' ' || *place == '\t') {
                if (place[1] == ' ' || place[1] == '\t')
                    continue;
                blank = place;
                ++numBlanks;
                digitsBeforeBlank = m_num_digits;
                continue;
            }
            if (isAfterRow)
                return Fail(m_row_line, "the row is longer than " + RowWidth(), RowHint());
            if (*place == '|') {
                if (m_num_digits != m_num_inputs)
                    return Fail(m_line, "'|' after " + Counted(m_num_digits, "digit") +
                                            ", not after " + Counted(m_num_inputs, "input"));
                continue;
            }
            if (!TakeDigit(*place))
                return FailDigit(*place, static_cast<size_t>(place - begin));
            if (m_num_digits == width) {
                isAfterRow = true;
                EndRow();
            }
        }
        const bool isOneLine = isAtStart && isAfterRow;
        if (isOneLine && blank && numBlanks == 1 && digitsBeforeBlank != m_num_inputs)
            return Fail(m_line, Counted(digitsBeforeBlank, "digit") +
                                    " before the blank, but .i is " + std::to_string(m_num_inputs));
        return true;
    }

    std::string RowHint() const
    {
        return m_row_line == m_line ? ""
                                    : "it goes on in line " + std::to_string(m_line) +
                                          "; is a digit missing before that?";
    }

    bool FailDigit(char digit, size_t column)
    {
        const bool isInput = m_num_digits < m_num_inputs;
        return Fail(m_line,
                    Shown(std::string(1, digit)) + " is not a digit of an " +
                        std::string(isInput ? "input" : "output") + ", at character " +
                        std::to_string(column + 1) + " of the row",
                    isInput ? "inputs are 0, 1 or - (also 2, x)"
                            : "outputs are 0, 1 (also 4), - (also 2, x) or ~ (also 3)");
    }

    bool TakeDigit(char digit)
    {
        const size_t numWords = m_pla.space.NumWords();
        assert(m_row.size() == 3 * numWords);
        if (m_num_digits < m_num_inputs) {
            const size_t bit = 2 * m_num_digits;
            const bool isEither = digit == '-' || digit == '2' || digit == 'x' || digit == 'X';
            if (digit != '0' && digit != '1' && !isEither)
                return false;
            for (size_t set = 0; set < 3; ++set) {
                if (digit != '1')
                    SetBit(m_row.data() + set * numWords, bit);
                if (digit != '0')
                    SetBit(m_row.data() + set * numWords, bit + 1);
            }
        } else {
            const size_t bit = m_pla.space.OutputBit(m_num_digits - m_num_inputs);
            size_t set = 0;
            switch (digit) {
            case '1':
            case '4':
                break;
            case '-':
            case '2':
            case 'x':
            case 'X':
                set = 1;
                break;
            case '0':
                set = 2;
                break;
            case '~':
            case '3':
                set = 3;
                break;
            default:
                return false;
            }
            if (set < 3) {
                SetBit(m_row.data() + set * numWords, bit);
                m_has_set[set] = true;
            }
        }
        ++m_num_digits;
        return true;
    }

    void EndRow()
    {
        const size_t numWords = m_pla.space.NumWords();
        assert(m_num_digits == m_num_inputs + m_num_outputs);
        if (m_has_set[0]) {
            m_pla.on.Append(m_row.data());
            m_pla.onLines.push_back(static_cast<uint32_t>(m_row_line));
        }
        if (m_has_set[1])
            m_pla.free.Append(m_row.data() + numWords);
        if (m_has_set[2]) {
            m_pla.off.Append(m_row.data() + 2 * numWords);
            m_pla.offLines.push_back(static_cast<uint32_t>(m_row_line));
        }
        std::fill(m_row.begin(), m_row.end(), 0);
        m_has_set[0] = m_has_set[1] = m_has_set[2] = false;
        m_num_digits = 0;
        ++m_pla.numRows;
        assert(m_pla.on.Size() == m_pla.onLines.size());
        assert(m_pla.off.Size() == m_pla.offLines.size());
    }

    bool Finish()
    {
        if (!m_has_inputs || !m_has_outputs)
            return Fail(std::max<size_t>(m_line, 1),
                        std::string("no ") + (m_has_inputs ? ".o" : ".i") + " in the file",
                        "write .i and .o, the numbers of inputs and outputs, before the first row");
        if (!IsRowWhole())
            return false;
        if (!CheckNames("input", ".ilb", m_input_names_line, m_num_inputs, m_pla.inputs) ||
            !CheckNames("output", ".ob", m_output_names_line, m_num_outputs, m_pla.outputs))
            return false;
        m_pla.hasInputNames = m_input_names_line != 0;
        m_pla.hasOutputNames = m_output_names_line != 0;
        if (m_pla.type == PlaType::F || m_pla.type == PlaType::Fr)
            m_pla.free.Resize(0);
        if (m_pla.type == PlaType::F || m_pla.type == PlaType::Fd) {
            m_pla.off.Resize(0);
            m_pla.offLines.clear();
        }
        return true;
    }

    // Names from the file, or made-up ones: i0, i1, ..., o0, o1, ...
    bool CheckNames(const char* what, const char* directive, size_t line, size_t count,
                    std::vector<std::string>& names)
    {
        if (line == 0) {
            for (size_t index = 0; index < count; ++index)
                names.push_back(what[0] + std::to_string(index));
            return true;
        }
        if (names.size() == count)
            return true;
        return Fail(line, std::string(directive) + " has " + Counted(names.size(), "name") +
                              " for " + Counted(count, what));
    }

    const std::string& m_text;
    Pla& m_pla;
    PlaFault& m_fault;
    size_t m_line = 0;
    bool m_is_ended = false;
    bool m_has_inputs = false;
    bool m_has_outputs = false;
    size_t m_num_inputs = 0;
    size_t m_num_outputs = 0;
    size_t m_input_names_line = 0;
    size_t m_output_names_line = 0;
    std::vector<uint64_t> m_row; // the cubes of the row: on, free and off
    bool m_has_set[3] = {false, false, false};
    size_t m_row_line = 0;
    size_t m_num_digits = 0; // of the row that has begun
};

} // namespace

bool ReadPla(const std::string& text, Pla& pla, PlaFault& fault)
{
    pla = Pla();
    fault = PlaFault();
    return PlaReader(text, pla, fault).Read();
}

} // namespace booleq
