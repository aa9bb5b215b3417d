#include "proof_check.h"

#include <algorithm>
#include <cassert>
#include <cstdint>
#include <map>
#include <vector>

namespace decide_pairs {

namespace {

typedef uint32_t Literal; // 2 * variable, plus 1 for its inversion
typedef std::vector<Literal> Clause;

constexpr uint32_t kNone = UINT32_MAX;
constexpr int kMaxVariable = 1 << 28;

Literal Inverted(Literal literal)
{
    return literal ^ 1u;
}

// Reads lines of numbers, the format of both files.
class NumberReader {
  public:
    explicit NumberReader(const std::string& text) : m_text(text) {}

    size_t Line() const { return m_line; }

    // False at the end of the text.
    bool SkipBlanks()
    {
        for (; m_place < m_text.size(); ++m_place) {
            const char character = m_text[m_place];
            if (character == '\n')
                ++m_line;
            else if (character != ' ' && character != '\t' && character != '\r')
                return true;
        }
        return false;
    }

    // Takes the character if it comes next.
    bool Take(char character)
    {
        if (!SkipBlanks() || m_text[m_place] != character)
            return false;
        ++m_place;
        return true;
    }

    void SkipLine() { m_place = std::min(m_text.find('\n', m_place), m_text.size()); }

    // Fails: false for anything else.
    bool Number(long& number)
    {
        if (!SkipBlanks())
            return false;
        size_t place = m_place + (m_text[m_place] == '-' ? 1 : 0);
        const size_t first = place;
        for (number = 0; place < m_text.size() && m_text[place] >= '0' && m_text[place] <= '9' &&
                         number <= kMaxVariable;
             ++place)
            number = 10 * number + (m_text[place] - '0');
        if (place == first || number > kMaxVariable)
            return false;
        if (first != m_place)
            number = -number;
        m_place = place;
        return true;
    }

    // The literals up to 0, without repetition.  Fails: false.
    bool ReadClause(Clause& clause)
    {
        clause.clear();
        for (long number = 0; Number(number);) {
            if (number == 0)
                return true;
            const Literal literal = number > 0 ? 2 * static_cast<Literal>(number)
                                               : 2 * static_cast<Literal>(-number) + 1;
            if (std::find(clause.begin(), clause.end(), literal) == clause.end())
                clause.push_back(literal);
        }
        return false;
    }

    bool Word(const std::string& word)
    {
        if (!SkipBlanks() || m_text.compare(m_place, word.size(), word) != 0)
            return false;
        m_place += word.size();
        return true;
    }

  private:
    const std::string& m_text;
    size_t m_place = 0;
    size_t m_line = 1;
};

// The clauses that are not deleted, and what follows from them by unit propagation.
// Invariants:
// 1. Clauses of two or more literals are watched by their first two. When nothing is left to
//    propagate and there is no conflict, a watched literal is false only if the other one is true.
// 2. The trail has the true literals in the order in which they followed. The reason for each is a
//    clause whose other literals became false before it, or kNone for an assumption.
// 3. There are no assumptions outside IsImplied.
class Clauses {
  public:
    void Add(const Clause& clause)
    {
        const auto index = static_cast<uint32_t>(m_clauses.size());
        m_clauses.push_back({clause, true});
        for (const Literal literal : clause)
            Reserve(literal);
        Clause key = clause;
        std::sort(key.begin(), key.end());
        m_indices[std::move(key)].push_back(index);
        Attach(index);
        Propagate();
    }

    // Fails: false if there is no such clause.
    bool Delete(Clause clause)
    {
        std::sort(clause.begin(), clause.end());
        const auto found = m_indices.find(clause);
        if (found == m_indices.end())
            return false;
        const uint32_t index = found->second.back();
        found->second.pop_back();
        if (found->second.empty())
            m_indices.erase(found);
        m_clauses[index].isThere = false;
        // What followed from it, and what came later, must be derived again without it.
        if (m_has_conflict) {
            m_has_conflict = false;
            Restart(0);
            return true;
        }
        for (const Literal literal : clause)
            if (IsTrue(literal) && m_reasons[literal / 2] == index)
                Restart(m_places[literal / 2]);
        return true;
    }

    // Whether the clause may be added: it follows by unit propagation, or else its resolvents on
    // its first literal show that it keeps satisfiable clauses satisfiable.
    bool IsImplied(const Clause& clause, bool& isByResolvents)
    {
        isByResolvents = false;
        if (m_has_conflict)
            return true;
        for (const Literal literal : clause)
            Reserve(literal);
        const size_t numTrue = m_trail.size();
        bool isImplied = Refutes(clause, kNone);
        if (!isImplied && !clause.empty()) {
            isByResolvents = true;
            isImplied = AllResolventsFollow(clause.front());
        }
        Undo(numTrue);
        return isImplied;
    }

  private:
    struct Entry {
        Clause literals;
        bool isThere;
    };

    bool IsTrue(Literal literal) const { return m_values[literal] > 0; }
    bool IsFalse(Literal literal) const { return m_values[literal] < 0; }

    void Reserve(Literal literal)
    {
        const size_t size = (literal | 1u) + size_t(1);
        if (m_values.size() >= size)
            return;
        m_values.resize(size, 0);
        m_watches.resize(size);
        m_reasons.resize(size / 2, kNone);
        m_places.resize(size / 2, 0);
    }

    void MakeTrue(Literal literal, uint32_t reason)
    {
        assert(m_values[literal] == 0);
        m_values[literal] = 1;
        m_values[Inverted(literal)] = -1;
        m_reasons[literal / 2] = reason;
        m_places[literal / 2] = m_trail.size();
        m_trail.push_back(literal);
    }

    void Undo(size_t numTrue)
    {
        for (; m_trail.size() > numTrue; m_trail.pop_back())
            m_values[m_trail.back()] = m_values[Inverted(m_trail.back())] = 0;
        m_num_propagated = std::min(m_num_propagated, numTrue);
    }

    // Forgets the true literals from a place on, and derives again what follows.
    void Restart(size_t numTrue)
    {
        Undo(numTrue);
        m_num_propagated = 0;
        for (const uint32_t index : m_short)
            if (m_clauses[index].isThere)
                AttachShort(index);
        Propagate();
    }

    void AttachShort(uint32_t index)
    {
        const Clause& literals = m_clauses[index].literals;
        assert(literals.size() <= 1);
        if (literals.empty() || IsFalse(literals.front()))
            m_has_conflict = true;
        else if (!IsTrue(literals.front()))
            MakeTrue(literals.front(), index);
    }

    // Requires: no assumptions, so what follows immediately stays.
    void Attach(uint32_t index)
    {
        Clause& literals = m_clauses[index].literals;
        if (literals.size() <= 1) {
            m_short.push_back(index);
            AttachShort(index);
            return;
        }
        // Puts literals that are not false first.
        std::stable_partition(literals.begin(), literals.end(),
                              [this](Literal literal) { return !IsFalse(literal); });
        m_watches[literals[0]].push_back(index);
        m_watches[literals[1]].push_back(index);
        if (IsFalse(literals[0]))
            m_has_conflict = true;
        else if (IsFalse(literals[1]) && !IsTrue(literals[0]))
            MakeTrue(literals[0], index);
    }

    // Makes true all literals that follow.  Fails: sets m_has_conflict for a clause that is false.
    void Propagate()
    {
        while (!m_has_conflict && m_num_propagated < m_trail.size())
            Visit(Inverted(m_trail[m_num_propagated++]));
    }

    // Visits the clauses that watch a literal that has become false.
    void Visit(Literal falseLiteral)
    {
        std::vector<uint32_t>& watches = m_watches[falseLiteral];
        size_t numKept = 0;
        for (size_t place = 0; place < watches.size(); ++place) {
            const uint32_t index = watches[place];
            Clause& literals = m_clauses[index].literals;
            if (!m_clauses[index].isThere)
                continue;
            if (literals[0] == falseLiteral)
                std::swap(literals[0], literals[1]);
            assert(literals[1] == falseLiteral);
            const auto other =
                IsTrue(literals[0])
                    ? literals.end()
                    : std::find_if(literals.begin() + 2, literals.end(),
                                   [this](Literal literal) { return !IsFalse(literal); });
            if (other != literals.end()) {
                std::swap(literals[1], *other);
                m_watches[literals[1]].push_back(index);
                continue;
            }
            watches[numKept++] = index;
            if (m_has_conflict || IsTrue(literals[0]))
                continue;
            if (IsFalse(literals[0]))
                m_has_conflict = true;
            else
                MakeTrue(literals[0], index);
        }
        watches.resize(numKept);
    }

    // Whether a conflict follows if all literals except one are false. The assumptions stay.
    bool Refutes(const Clause& clause, Literal except)
    {
        assert(!m_has_conflict);
        for (const Literal literal : clause) {
            if (literal == except || IsFalse(literal))
                continue;
            if (IsTrue(literal))
                return true;
            MakeTrue(Inverted(literal), kNone);
        }
        Propagate();
        const bool hasConflict = m_has_conflict;
        m_has_conflict = false;
        return hasConflict;
    }

    // Requires: the clause of the literal is assumed to be false, and there is no conflict.
    bool AllResolventsFollow(Literal literal)
    {
        const size_t numTrue = m_trail.size();
        for (size_t index = 0; index < m_clauses.size(); ++index) {
            // A copy, because propagation reorders literals
            const Clause clause = m_clauses[index].isThere ? m_clauses[index].literals : Clause();
            if (std::find(clause.begin(), clause.end(), Inverted(literal)) == clause.end())
                continue;
            const bool follows = Refutes(clause, Inverted(literal));
            Undo(numTrue);
            if (!follows)
                return false;
        }
        return true;
    }

    std::vector<Entry> m_clauses;
    std::map<Clause, std::vector<uint32_t>> m_indices; // of existing clauses, sorted literals
    std::vector<uint32_t> m_short;                     // clauses of one literal or none
    std::vector<std::vector<uint32_t>> m_watches;      // by literal
    std::vector<int8_t> m_values;                      // by literal: 1 true, -1 false, 0 neither
    std::vector<uint32_t> m_reasons;                   // by variable
    std::vector<size_t> m_places;                      // by variable: the place on the trail
    std::vector<Literal> m_trail;
    size_t m_num_propagated = 0;
    bool m_has_conflict = false;
};

ProofVerdict Refused(const char* file, const NumberReader& reader, const std::string& why)
{
    ProofVerdict verdict;
    verdict.reason = std::string(file) + ", line " + std::to_string(reader.Line()) + ": " + why;
    return verdict;
}

} // namespace

ProofVerdict CheckProof(const std::string& dimacs, const std::string& proof)
{
    Clauses clauses;
    Clause clause;
    NumberReader input(dimacs);
    while (input.Take('c'))
        input.SkipLine();
    long numVariables = 0;
    long numClauses = 0;
    if (!input.Word("p cnf") || !input.Number(numVariables) || !input.Number(numClauses))
        return Refused("clauses", input, "no line 'p cnf VARIABLES CLAUSES'");
    for (long number = 0; number < numClauses; ++number) {
        if (!input.ReadClause(clause))
            return Refused("clauses", input, "no clause");
        clauses.Add(clause);
    }
    if (input.SkipBlanks())
        return Refused("clauses", input, "more than was said");

    NumberReader steps(proof);
    ProofVerdict verdict;
    while (steps.SkipBlanks()) {
        const bool isDeleted = steps.Take('d');
        if (!steps.ReadClause(clause))
            return Refused("proof", steps, "no clause");
        if (isDeleted) {
            if (!clauses.Delete(clause))
                return Refused("proof", steps, "deletes a clause that is not there");
            ++verdict.numDeleted;
            continue;
        }
        bool isByResolvents = false;
        if (!clauses.IsImplied(clause, isByResolvents))
            return Refused("proof", steps, "the clause does not follow");
        ++verdict.numAdded;
        verdict.numByResolvents += isByResolvents ? 1 : 0;
        if (clause.empty()) {
            verdict.isAccepted = true;
            return verdict;
        }
        clauses.Add(clause);
    }
    return Refused("proof", steps, "it ends without the empty clause");
}

} // namespace decide_pairs
