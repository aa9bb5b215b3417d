// An operator-precedence reader: operands go to the tree at once; operators wait on a stack until
// an operator that binds no tighter, a closing parenthesis or the end of the text releases them.
#include "foreign_tree.h"

#include <algorithm>
#include <cassert>
#include <cstring>
#include <unordered_map>

namespace booleq {

namespace {

bool IsNameCharacter(char character)
{
    return (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           (character >= '0' && character <= '9') || character == '_' || character == '$';
}

bool IsBlankCharacter(char character)
{
    return character == ' ' || character == '\t' || character == '\n';
}

std::string InQuotes(const std::string& text)
{
    return "\"" + text + "\"";
}

class Reader {
  public:
    Reader(const std::string& text, const Notation& notation, ForeignTree& tree)
        : m_text(text), m_notation(notation), m_tree(tree)
    {
    }

    bool Run()
    {
        SkipBlanks();
        while (m_position < m_text.size()) {
            if (!(m_wants_operand ? ReadOperand() : ReadAfterOperand()))
                return false;
            SkipBlanks();
        }
        if (m_wants_operand)
            return Refuse("the text ends where an operand must follow");
        while (!m_waiting.empty()) {
            if (!m_waiting.back().form)
                return Refuse("a parenthesis is not closed");
            Release();
        }
        assert(m_operands.size() == 1);
        assert(m_operands.back() == m_tree.nodes.size() - 1); // post-order: the root is the last
        return true;
    }

    const std::string& Fault() const { return m_fault; }

  private:
    struct Waiting {
        const OperatorForm* form; // null for an open parenthesis
        bool isPrefix;
    };

    bool Refuse(const std::string& fault)
    {
        m_fault = fault;
        return false;
    }

    // The character that cannot be read, and its place.
    std::string Here() const
    {
        return InQuotes(m_text.substr(m_position, 1)) + " at character " +
               std::to_string(m_position + 1);
    }

    void SkipBlanks()
    {
        while (m_position < m_text.size() && IsBlankCharacter(m_text[m_position]))
            ++m_position;
    }

    bool StartsWith(const char* text) const
    {
        const size_t length = std::strlen(text);
        if (m_text.compare(m_position, length, text) != 0)
            return false;
        // A word must end here.
        return !IsNameCharacter(text[length - 1]) || m_position + length >= m_text.size() ||
               !IsNameCharacter(m_text[m_position + length]);
    }

    // The longest of the forms that matches here; null if none does.
    const OperatorForm* Match(const std::vector<OperatorForm>& forms) const
    {
        const OperatorForm* longest = nullptr;
        for (const OperatorForm& form : forms)
            if (StartsWith(form.text) &&
                (!longest || std::strlen(form.text) > std::strlen(longest->text)))
                longest = &form;
        return longest;
    }

    void Add(Meaning meaning, uint32_t left, uint32_t right, const char* text)
    {
        assert(meaning == Meaning::Input || left <= m_tree.nodes.size());
        assert(right <= m_tree.nodes.size());
        m_tree.nodes.push_back({meaning, left, right, text});
        m_operands.push_back(static_cast<uint32_t>(m_tree.nodes.size() - 1));
    }

    uint32_t TakeOperand()
    {
        assert(!m_operands.empty());
        const uint32_t operand = m_operands.back();
        m_operands.pop_back();
        return operand;
    }

    void Release()
    {
        assert(!m_waiting.empty());
        const Waiting waiting = m_waiting.back();
        assert(waiting.form); // an open parenthesis has nothing to release
        m_waiting.pop_back();
        const uint32_t right = TakeOperand();
        if (waiting.isPrefix)
            Add(waiting.form->meaning, right, 0, waiting.form->text);
        else
            Add(waiting.form->meaning, TakeOperand(), right, waiting.form->text);
    }

    bool ReadOperand();
    bool ReadPrefix(const OperatorForm& form);
    bool ReadConstant(bool& isThere);
    bool ReadName();
    bool ReadAfterOperand();
    bool ReadBinary(const OperatorForm& form);
    bool ReadClosing();
    bool AddName(const std::string& name);

    const std::string& m_text;
    const Notation& m_notation;
    ForeignTree& m_tree;
    size_t m_position = 0;
    bool m_wants_operand = true;
    std::vector<Waiting> m_waiting;
    std::vector<uint32_t> m_operands;
    std::unordered_map<std::string, uint32_t> m_numbers; // of names
    std::string m_fault;
};

bool Reader::ReadOperand()
{
    if (m_text[m_position] == '(') {
        m_waiting.push_back({nullptr, false});
        ++m_position;
        return true;
    }
    if (const OperatorForm* form = Match(m_notation.prefixes))
        return ReadPrefix(*form);
    bool isConstant = false;
    if (!ReadConstant(isConstant))
        return false;
    if (isConstant)
        return true;
    return ReadName();
}

bool Reader::ReadPrefix(const OperatorForm& form)
{
    if (form.meaning == Meaning::Foreign)
        return Refuse(InQuotes(form.text) + " before an operand is a reduction of a vector there");
    const OperatorForm* before = m_waiting.empty() ? nullptr : m_waiting.back().form;
    if (before && before->level > form.level)
        return Refuse(InQuotes(form.text) + " may not follow " + InQuotes(before->text) + " there");
    if (before && m_waiting.back().isPrefix && !m_notation.prefixesNest)
        return Refuse(InQuotes(form.text) + " cannot be repeated there without parentheses");
    m_waiting.push_back({&form, true});
    m_position += std::strlen(form.text);
    return true;
}

bool Reader::ReadConstant(bool& isThere)
{
    const bool isZero = StartsWith(m_notation.zero);
    isThere = isZero || StartsWith(m_notation.one);
    if (isThere) {
        const bool isWide = m_notation.values != Values::Bits && std::strlen(m_notation.zero) == 1;
        Add(isZero ? (isWide ? Meaning::WideZero : Meaning::Zero)
                   : (isWide ? Meaning::WideOne : Meaning::One),
            0, 0, nullptr);
        m_position += std::strlen(m_notation.zero);
        m_wants_operand = false;
        return true;
    }
    const char character = m_text[m_position];
    if (character < '0' || character > '9')
        return true;
    // A plain number in a notation that writes constants differently: Verilog's are 32 bits wide.
    const bool isLone =
        m_position + 1 >= m_text.size() ||
        (!IsNameCharacter(m_text[m_position + 1]) && m_text[m_position + 1] != '\'');
    if (m_notation.values != Values::Vector || character > '1' || !isLone)
        return Refuse("the number at character " + std::to_string(m_position + 1) +
                      " is not a bit there");
    Add(character == '0' ? Meaning::WideZero : Meaning::WideOne, 0, 0, nullptr);
    isThere = true;
    ++m_position;
    m_wants_operand = false;
    return true;
}

bool Reader::ReadName()
{
    const size_t start = m_position;
    if (m_text[start] == '\\' && m_notation.escape) {
        const bool isVhdl = m_notation.ignoresCase;
        ++m_position;
        while (m_position < m_text.size()) {
            const char character = m_text[m_position];
            const bool isDoubled = isVhdl && character == '\\' && m_position + 1 < m_text.size() &&
                                   m_text[m_position + 1] == '\\';
            m_position += isDoubled ? 2 : 1;
            if (!isDoubled && (isVhdl ? character == '\\' : IsBlankCharacter(character)))
                break;
        }
        return AddName(m_text.substr(start, m_position - start));
    }
    while (m_position < m_text.size() && IsNameCharacter(m_text[m_position]))
        ++m_position;
    if (m_position == start)
        return Refuse(Here() + " is not an operand there");
    const std::string name = m_text.substr(start, m_position - start);
    if (!IsPlain(m_notation, name))
        return Refuse(InQuotes(name) + " is not a name there");
    return AddName(name);
}

bool Reader::AddName(const std::string& name)
{
    const std::string canonical = CanonicalName(m_notation, name);
    const auto found = m_numbers.emplace(canonical, static_cast<uint32_t>(m_tree.names.size()));
    if (found.second)
        m_tree.names.push_back(canonical);
    Add(Meaning::Input, found.first->second, 0, nullptr);
    m_wants_operand = false;
    return true;
}

bool Reader::ReadAfterOperand()
{
    if (m_text[m_position] == ')')
        return ReadClosing();
    if (const OperatorForm* form = Match(m_notation.postfixes)) {
        Add(form->meaning, TakeOperand(), 0, form->text);
        m_position += std::strlen(form->text);
        return true;
    }
    if (const OperatorForm* form = Match(m_notation.binaries)) {
        m_position += std::strlen(form->text);
        return ReadBinary(*form);
    }
    const bool startsOperand = m_text[m_position] == '(' || Match(m_notation.prefixes) ||
                               IsNameCharacter(m_text[m_position]);
    if (m_notation.hasAdjacentAnd && startsOperand)
        for (const OperatorForm& form : m_notation.binaries)
            if (form.meaning == Meaning::And)
                return ReadBinary(form);
    return Refuse(Here() + " does not join two operands there");
}

bool Reader::ReadBinary(const OperatorForm& form)
{
    if (form.meaning == Meaning::Foreign)
        return Refuse(InQuotes(form.text) + " is for other values there");
    while (!m_waiting.empty() && m_waiting.back().form) {
        const Waiting& before = m_waiting.back();
        if (before.form->level < form.level)
            break;
        if (!before.isPrefix && before.form->level == form.level) {
            const bool bothChain = form.chain != Chain::None && before.form->chain != Chain::None;
            const bool isSame = before.form->meaning == form.meaning;
            if (!bothChain || (form.chain == Chain::Same && !isSame))
                return Refuse(InQuotes(before.form->text) + " and " + InQuotes(form.text) +
                              " need parentheses there");
        }
        Release();
    }
    m_waiting.push_back({&form, false});
    m_wants_operand = true;
    return true;
}

bool Reader::ReadClosing()
{
    assert(!m_wants_operand);
    while (!m_waiting.empty() && m_waiting.back().form)
        Release();
    if (m_waiting.empty())
        return Refuse("a \")\" too many");
    m_waiting.pop_back();
    ++m_position;
    return true;
}

} // namespace

bool Read(const std::string& text, const Notation& notation, ForeignTree& tree, std::string& fault)
{
    tree = ForeignTree();
    tree.notation = &notation;
    Reader reader(text, notation, tree);
    if (reader.Run())
        return true;
    fault = reader.Fault();
    return false;
}

std::string CanonicalName(const Notation& notation, const std::string& spelled)
{
    std::string name = spelled;
    if (!spelled.empty() && spelled[0] == '\\') {
        if (notation.ignoresCase)
            return name; // distinct from every plain name
        name = name.substr(1);
        while (!name.empty() && IsBlankCharacter(name.back()))
            name.pop_back();
        return name;
    }
    if (notation.ignoresCase)
        std::transform(name.begin(), name.end(), name.begin(), [](char character) {
            return character >= 'A' && character <= 'Z' ? static_cast<char>(character | 0x20)
                                                        : character;
        });
    return name;
}

std::string WriteWhole(const ForeignTree& tree, const std::vector<std::string>& names)
{
    struct Piece {
        const char* text;
        uint32_t node;
    };
    assert(!tree.nodes.empty());
    assert(names.size() >= tree.names.size());
    std::string text;
    std::vector<Piece> pending = {{nullptr, static_cast<uint32_t>(tree.nodes.size() - 1)}};
    while (!pending.empty()) {
        const Piece piece = pending.back();
        pending.pop_back();
        if (piece.text) {
            text += piece.text;
            continue;
        }
        const ForeignTree::Node& node = tree.nodes[piece.node];
        switch (node.meaning) {
        case Meaning::Zero:
        case Meaning::WideZero:
            text += "0";
            break;
        case Meaning::One:
        case Meaning::WideOne:
            text += "1";
            break;
        case Meaning::Input:
            text += names[node.left];
            break;
        case Meaning::BitNot:
        case Meaning::LogicalNot:
            text += node.text;
            pending.push_back({nullptr, node.left});
            break;
        case Meaning::And:
        case Meaning::Or:
        case Meaning::Xor:
        case Meaning::Nand:
        case Meaning::Nor:
        case Meaning::Nxor:
        case Meaning::Add:
        case Meaning::Multiply:
        case Meaning::Foreign:
            pending.insert(pending.end(), {{")", 0},
                                           {nullptr, node.right},
                                           {" ", 0},
                                           {node.text, 0},
                                           {" ", 0},
                                           {nullptr, node.left},
                                           {"(", 0}});
            break;
        }
    }
    return text;
}

} // namespace booleq
