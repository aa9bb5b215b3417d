#include "cell_types.h"

#include <algorithm>
#include <cassert>
#include <optional>

#include "init_digits.h"
#include "read_fault.h"
#include "rows.h"
#include "source_text.h"

namespace booleq {

namespace {

constexpr uint32_t kMaxParameterBits = 1u << 16;
constexpr size_t kMaxCellPins = 16; // inputs, for all tables of a cell together

std::vector<std::string> Words(std::string_view line)
{
    line = line.substr(0, line.find('#'));
    std::vector<std::string> words;
    size_t place = 0;
    while ((place = line.find_first_not_of(" \t\r", place)) != std::string_view::npos) {
        const size_t end = std::min(line.find_first_of(" \t\r", place), line.size());
        words.emplace_back(line.substr(place, end - place));
        place = end;
    }
    return words;
}

std::string JoinWords(const std::vector<std::string>& words, size_t first)
{
    std::string text;
    for (size_t word = first; word < words.size(); ++word)
        text += (word == first ? "" : " ") + words[word];
    return text;
}

// Reads the text of one file line by line; a type is complete when the next one begins.
class TypeReader {
  public:
    // Throws ReadFault with the line.
    std::vector<CellType> Read(std::string_view text)
    {
        while (!text.empty()) {
            ++m_line;
            const size_t end = std::min(text.find('\n'), text.size());
            m_words = Words(text.substr(0, end));
            text.remove_prefix(std::min(end + 1, text.size()));
            if (!m_words.empty())
                ReadLine();
        }
        Complete();
        return std::move(m_types);
    }

  private:
    struct Directive {
        const char* word;
        size_t minWords;
        void (TypeReader::*read)();
    };

    [[noreturn]] void Refuse(const std::string& what) const { ThrowAtLine(m_line, what); }

    void ReadLine()
    {
        static constexpr Directive kDirectives[] = {
            {"cell", 2, &TypeReader::ReadCell},         {"input", 2, &TypeReader::ReadInput},
            {"other", 2, &TypeReader::ReadOther},       {"vector", 2, &TypeReader::ReadVector},
            {"init", 2, &TypeReader::ReadInit},         {"table", 4, &TypeReader::ReadTable},
            {"inner", 4, &TypeReader::ReadInner},       {"open", 2, &TypeReader::ReadOpen},
            {"constant", 3, &TypeReader::ReadConstant}, {"unread", 2, &TypeReader::ReadUnread},
            {"note", 2, &TypeReader::ReadNote}};
        for (const Directive& directive : kDirectives) {
            if (m_words[0] != directive.word)
                continue;
            if (m_words.size() < directive.minWords)
                Refuse("'" + m_words[0] + "' needs more words");
            if (directive.read != &TypeReader::ReadCell && !m_type)
                Refuse("'" + m_words[0] + "' comes before the first 'cell'");
            (this->*directive.read)();
            return;
        }
        Refuse("expected cell, input, other, vector, init, table, inner, open, constant, unread or "
               "note instead of " +
               Quoted(m_words[0]));
    }

    void ReadCell()
    {
        Complete();
        if (m_words.size() != 2)
            Refuse("a cell has one name");
        m_type.emplace();
        m_type->name = m_words[1];
    }

    void ReadInput()
    {
        for (size_t word = 1; word < m_words.size(); ++word)
            AddName(m_type->inputPins, m_words[word]);
        if (m_type->inputPins.size() > kMaxCellPins)
            Refuse("more than 16 inputs");
        if (!m_type->steps.empty())
            Refuse("list the inputs before the tables");
    }

    void ReadOther()
    {
        for (size_t word = 1; word < m_words.size(); ++word)
            AddName(m_type->otherPins, m_words[word]);
    }

    void AddName(std::vector<std::string>& names, const std::string& name)
    {
        for (const std::vector<std::string>* all :
             {&m_type->inputPins, &m_type->outputPins, &m_type->otherPins})
            if (std::find(all->begin(), all->end(), name) != all->end())
                Refuse("pin " + Quoted(name) + " is listed twice");
        names.push_back(name);
    }

    void ReadVector()
    {
        m_type->vectorPin = m_words[1];
        if (m_words.size() > 2)
            m_type->widthParameter = m_words[2];
    }

    uint64_t Number(const std::string& word, uint64_t max) const
    {
        InitDigits digits;
        if (!ReadInitDigits(word, BareDigits::Decimal, 64, digits) || digits.hasUnknown ||
            digits.isLong || digits.words[0] > max)
            Refuse("expected a number up to " + std::to_string(max) + " instead of " +
                   Quoted(word));
        return digits.words[0];
    }

    // init NAME BITS [hex|decimal|binary] [initial VALUE]
    void ReadInit()
    {
        CellParameter parameter;
        parameter.name = m_words[1];
        size_t word = 2;
        if (m_type->vectorPin.empty()) {
            if (m_words.size() < 3)
                Refuse("'init' needs a name and a number of bits");
            parameter.numBits = static_cast<uint32_t>(Number(m_words[word++], kMaxParameterBits));
            if (parameter.numBits == 0)
                Refuse("an init value has one bit at least");
        }
        for (; word < m_words.size(); ++word) {
            if (m_words[word] == "hex")
                parameter.form = BareDigits::Hex;
            else if (m_words[word] == "decimal")
                parameter.form = BareDigits::Decimal;
            else if (m_words[word] == "binary")
                parameter.form = BareDigits::Binary;
            else if (m_words[word] == "initial" && word + 1 < m_words.size())
                parameter.initial = Number(m_words[++word], UINT64_MAX);
            else
                Refuse("expected hex, decimal, binary or initial VALUE instead of " +
                       Quoted(m_words[word]));
        }
        m_type->parameters.push_back(parameter);
    }

    // table PIN = INIT[31:0] PIN... [when PARAMETER=VALUE [initial]...]
    void ReadTable()
    {
        AddName(m_type->outputPins, m_words[1]);
        ReadStep(true);
    }

    void ReadInner() { ReadStep(false); }

    void ReadStep(bool isOutput)
    {
        if (m_words[2] != "=")
            Refuse("expected '=' after the output");
        CellStep step;
        step.name = m_words[1];
        step.isOutput = isOutput;
        const auto when = std::find(m_words.begin(), m_words.end(), "when");
        const auto numWords = static_cast<size_t>(when - m_words.begin());
        if (when != m_words.end())
            ReadConditions(numWords + 1, step);
        for (size_t word = 4; word < numWords; ++word)
            step.inputs.push_back(FindSource(m_words[word]));
        if (m_type->vectorPin.empty())
            ReadSource(step);
        else if (m_type->parameters.size() != 1 || m_words[3] != m_type->parameters[0].name)
            Refuse("a table of a vector has one init value");
        m_type->steps.push_back(std::move(step));
    }

    // PARAMETER=VALUE [initial], one or more times.
    void ReadConditions(size_t word, CellStep& step) const
    {
        for (; word < m_words.size(); ++word) {
            const size_t sign = m_words[word].find('=');
            if (m_words[word] == "initial" && !step.conditions.empty()) {
                step.conditions.back().isInitial = true;
                continue;
            }
            if (sign == 0 || sign == std::string::npos)
                Refuse("expected PARAMETER=VALUE after 'when' instead of " + Quoted(m_words[word]));
            step.conditions.push_back(
                {m_words[word].substr(0, sign), m_words[word].substr(sign + 1), false});
        }
        if (step.conditions.empty())
            Refuse("expected PARAMETER=VALUE after 'when'");
    }

    uint32_t FindSource(const std::string& name) const
    {
        const auto pin = std::find(m_type->inputPins.begin(), m_type->inputPins.end(), name);
        if (pin != m_type->inputPins.end())
            return static_cast<uint32_t>(pin - m_type->inputPins.begin());
        for (size_t step = 0; step < m_type->steps.size(); ++step)
            if (m_type->steps[step].name == name)
                return static_cast<uint32_t>(m_type->inputPins.size() + step);
        Refuse(Quoted(name) + " is neither an input nor a table before this");
    }

    // Reads a parameter, bits of one (INIT[31:0]), or a number.
    void ReadSource(CellStep& step) const
    {
        if (step.inputs.size() > kMaxCellPins)
            Refuse("a table has more than 16 inputs");
        const uint64_t numRows = uint64_t(1) << step.inputs.size();
        const std::string& word = m_words[3];
        const size_t bracket = word.find('[');
        const std::string name = word.substr(0, bracket);
        for (uint32_t index = 0; index < m_type->parameters.size(); ++index)
            if (m_type->parameters[index].name == name)
                step.parameter = index;
        if (step.parameter == CellStep::kLiteral) {
            if (step.inputs.size() > 6)
                Refuse("there is no 'init' of the name " + Quoted(name));
            step.literal = Number(word, RowMask(static_cast<unsigned int>(step.inputs.size())));
            return;
        }
        const uint32_t numBits = m_type->parameters[step.parameter].numBits;
        uint64_t last = numBits - 1;
        if (bracket != std::string::npos) {
            const size_t colon = word.find(':', bracket);
            if (colon == std::string::npos || word.back() != ']')
                Refuse("bits of an init value are written INIT[31:0]");
            last = Number(word.substr(bracket + 1, colon - bracket - 1), numBits - 1);
            step.firstBit = static_cast<uint32_t>(
                Number(word.substr(colon + 1, word.size() - colon - 2), numBits - 1));
        }
        if (last + 1 != step.firstBit + numRows)
            Refuse("the table has " + std::to_string(numRows) + " rows, and there are " +
                   std::to_string(last + 1 - step.firstBit) + " bits");
    }

    void ReadOpen()
    {
        if (m_words.size() != 2 || m_words[1] != "0")
            Refuse("only 'open 0' is known");
        m_type->isOpenZero = true;
    }

    void ReadConstant()
    {
        m_type->kind = CellKind::Constant;
        AddName(m_type->outputPins, m_words[1]);
        m_type->value = Number(m_words[2], 1) != 0;
    }

    void ReadUnread()
    {
        m_type->kind = CellKind::Unread;
        m_type->note = JoinWords(m_words, 1);
    }

    void ReadNote() { m_type->note = JoinWords(m_words, 1); }

    void Complete()
    {
        if (!m_type)
            return;
        const bool isTable = m_type->kind == CellKind::Table;
        if (isTable && m_type->outputPins.empty())
            Refuse("cell " + Quoted(m_type->name) + " above has no table");
        if (!isTable && (!m_type->steps.empty() || m_type->outputPins.size() > 1))
            Refuse("cell " + Quoted(m_type->name) +
                   " above has a table, so it cannot be anything else");
        m_types.push_back(std::move(*m_type));
        m_type.reset();
    }

    uint64_t m_line = 0;
    std::vector<std::string> m_words;
    std::optional<CellType> m_type;
    std::vector<CellType> m_types;
};

bool HasSamePins(const CellType& left, const CellType& right)
{
    return left.inputPins == right.inputPins && left.outputPins == right.outputPins &&
           left.vectorPin == right.vectorPin;
}

} // namespace

const CellTypes& CellTypes::Known()
{
    static const CellTypes* const types = [] {
        auto* made = new CellTypes; // never deleted, so the order at exit does not matter
        std::string fault;
        const bool isRead = made->Add(KnownText(), "cells.txt", fault);
        assert(isRead);
        static_cast<void>(isRead);
        return made;
    }();
    return *types;
}

bool CellTypes::Add(std::string_view text, const std::string& file, std::string& fault)
{
    try {
        for (CellType& type : TypeReader().Read(text)) {
            std::vector<uint32_t>& variants = m_by_name[type.name];
            const auto same = std::find_if(variants.begin(), variants.end(), [&](uint32_t variant) {
                return HasSamePins(m_types[variant], type);
            });
            if (same != variants.end()) {
                m_types[*same] = std::move(type);
                continue;
            }
            // Types that come later are tried first: a user's before ours.
            variants.insert(variants.begin(), static_cast<uint32_t>(m_types.size()));
            m_types.push_back(std::move(type));
        }
    } catch (const ReadFault& found) {
        fault = file + ": " + found.text;
        return false;
    }
    return true;
}

bool CellTypes::AddFile(const std::string& file, std::string& fault)
{
    SourceText source;
    try {
        source.ReadFile(file);
    } catch (const ReadFault& found) {
        fault = file + ": " + found.text;
        return false;
    }
    return Add(source.Text(), file, fault);
}

const std::vector<uint32_t>* CellTypes::Find(const std::string& name) const
{
    const auto found = m_by_name.find(name);
    return found == m_by_name.end() ? nullptr : &found->second;
}

} // namespace booleq
