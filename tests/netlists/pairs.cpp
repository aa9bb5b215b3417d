// Compares pairs of netlists, equal or with one fault: the verdict must be right, and the named
// cause must be the fault that was put in.
//
// usage: netlist_pairs [COUNT [SEED]]
#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <map>
#include <string>
#include <vector>

#include "circuit.h"
#include "comparison.h"
#include "read_design.h"

namespace {

using namespace booleq;

// The change made to one table of the right netlist.
enum class Fault {
    None,
    OutputInverted,
    PinsSwapped,
    BitOrder,
    HalvesExchanged,
    InputInverted,
    DigitsShifted,
    DigitsRotated,
    DigitsLost,
    DigitsReversed,
    DigitChanged,
    OtherNet,
    InputStuck,
    NetRenamed,
    Missing,
    Added,
    NumFaults
};

CauseCode CodeOf(Fault fault)
{
    static const std::map<Fault, CauseCode> codes = {
        {Fault::OutputInverted, CauseCode::OutputInverted},
        {Fault::PinsSwapped, CauseCode::PinsSwapped},
        {Fault::BitOrder, CauseCode::BitOrder},
        {Fault::HalvesExchanged, CauseCode::HalvesExchanged},
        {Fault::InputInverted, CauseCode::InputInverted},
        {Fault::DigitsShifted, CauseCode::DigitsShifted},
        {Fault::DigitsRotated, CauseCode::DigitsRotated},
        {Fault::DigitsLost, CauseCode::DigitsLost},
        {Fault::DigitsReversed, CauseCode::DigitsReversed},
        {Fault::DigitChanged, CauseCode::DigitChanged},
        {Fault::OtherNet, CauseCode::OtherNet},
        {Fault::InputStuck, CauseCode::InputStuck}};
    return codes.at(fault);
}

// Whether the named cause says the same about the table, only more simply, and so may replace the
// fault's.
bool StandsFor(CauseCode named, Fault fault)
{
    return (named == CauseCode::HalvesExchanged && fault == Fault::InputInverted) ||
           (named == CauseCode::DigitsShifted && fault == Fault::DigitsRotated);
}

struct PairOfCircuits {
    Circuit left;
    Circuit right;
    Fault fault = Fault::None;
    size_t table = 0;    // of both netlists; it has the fault
    std::string renamed; // for NetRenamed, the net
};

// The value of row 'row' after a fault of the init value.
bool FaultyRow(const std::vector<bool>& rows, size_t row, Fault fault, size_t pin, size_t count,
               size_t digit)
{
    const size_t numRows = rows.size();
    switch (fault) {
    case Fault::OutputInverted:
        return !rows[row];
    case Fault::HalvesExchanged:
    case Fault::InputInverted:
        return rows[row ^ size_t(1) << pin];
    case Fault::DigitsShifted:
        return row >= count && rows[row - count];
    case Fault::DigitsRotated:
        return rows[(row + count) % numRows];
    case Fault::DigitsLost:
        return row < numRows - count && rows[row];
    case Fault::DigitsReversed:
        return rows[(numRows / digit - 1 - row / digit) * digit + row % digit];
    case Fault::DigitChanged:
        return rows[row] != (row == count - 1);
    default:
        return rows[row];
    }
}

void ChangeRows(CircuitTable& table, Fault fault, Random& random)
{
    const std::vector<bool> before = table.rows;
    const size_t numRows = before.size();
    const size_t digit = numRows >= 8 ? 4 : 1;
    size_t count = digit * (1 + Pick(random, numRows / digit - 1));
    if (fault == Fault::DigitsRotated && 2 * count == numRows)
        count = digit; // rotating by half would be the exchange of halves
    const size_t numPins = table.pins.size();
    const size_t pin = fault == Fault::HalvesExchanged ? numPins - 1 : Pick(random, numPins);
    for (size_t row = 0; row < numRows; ++row)
        table.rows[row] = FaultyRow(before, row, fault, pin, count, digit);
}

void PutFault(CircuitTable& table, Fault fault, const Circuit& circuit, Random& random)
{
    std::vector<int>& pins = table.pins;
    const size_t pin = Pick(random, pins.size());
    switch (fault) {
    case Fault::PinsSwapped:
        std::swap(pins[pin], pins[Pick(random, pins.size())]);
        return;
    case Fault::BitOrder:
        std::reverse(pins.begin(), pins.end());
        return;
    case Fault::OtherNet: {
        const auto net = static_cast<int>(Pick(random, circuit.nets.size()));
        if (net != table.output && std::find(pins.begin(), pins.end(), net) == pins.end())
            pins[pin] = net;
        return;
    }
    case Fault::InputStuck:
        if (pins[pin] >= 0)
            pins[pin] = Pick(random, 2) == 0 ? kZeroPin : kOnePin;
        return;
    default:
        ChangeRows(table, fault, random);
    }
}

// Reorders the pins and adds some that do not matter. What a shift brings in from unreached rows
// cannot be known, so for shifts these rows have the values as if the pin were idle.
void Disguise(CircuitTable& table, const Circuit& circuit, bool isAnything, Random& random)
{
    ShufflePins(table, random);
    if (table.pins.size() < 6 && Pick(random, 3) == 0) {
        const auto net = static_cast<int>(Pick(random, circuit.nets.size()));
        if (net != table.output &&
            std::find(table.pins.begin(), table.pins.end(), net) == table.pins.end())
            AddIdlePin(table, net, random);
    }
    if (table.pins.size() < 7 && Pick(random, 3) == 0)
        AddFixedPin(table, isAnything, random);
}

bool MovesRows(Fault fault)
{
    return fault == Fault::DigitsShifted || fault == Fault::DigitsLost ||
           fault == Fault::DigitChanged || fault == Fault::DigitsRotated ||
           fault == Fault::DigitsReversed;
}

bool IsOfOneTable(Fault fault)
{
    return fault != Fault::None && fault != Fault::NetRenamed && fault != Fault::Missing &&
           fault != Fault::Added;
}

size_t MinPins(Fault fault)
{
    if (fault == Fault::DigitsRotated)
        return 4; // with two digits, a rotation would be the exchange of halves
    if (fault == Fault::BitOrder)
        return 3;
    return fault == Fault::InputInverted || fault == Fault::PinsSwapped ? 2 : 1;
}

PairOfCircuits MakePair(Random& random)
{
    PairOfCircuits pair;
    pair.left = MakeCircuit(random);
    pair.right = pair.left;
    pair.table = Pick(random, pair.left.tables.size());
    if (Pick(random, 3) != 0)
        pair.fault = static_cast<Fault>(Pick(random, static_cast<size_t>(Fault::NumFaults)));
    if (pair.left.tables[pair.table].pins.size() < MinPins(pair.fault))
        pair.fault = Fault::OutputInverted;
    CircuitTable& faulty = pair.right.tables[pair.table];
    const bool isLast = Pick(random, 2) == 0; // change the pins first, then apply the fault
    if (IsOfOneTable(pair.fault) && !isLast)
        PutFault(faulty, pair.fault, pair.right, random);
    for (CircuitTable& table : pair.right.tables)
        Disguise(table, pair.right, !MovesRows(pair.fault) || !isLast, random);
    if (IsOfOneTable(pair.fault) && isLast)
        PutFault(faulty, pair.fault, pair.right, random);
    if (pair.fault == Fault::NetRenamed) {
        pair.renamed = pair.left.nets[static_cast<size_t>(pair.left.tables[pair.table].output)];
        pair.right.nets[static_cast<size_t>(faulty.output)] = "quite_another_name";
    }
    if (pair.fault == Fault::Missing)
        pair.right.tables.erase(pair.right.tables.begin() +
                                static_cast<std::ptrdiff_t>(pair.table));
    if (pair.fault == Fault::Added) {
        CircuitTable added = pair.right.tables[pair.table];
        added.name = "more";
        added.place = "more";
        added.output = static_cast<int>(pair.right.nets.size());
        pair.right.nets.push_back("more_out");
        pair.right.tables.push_back(added);
    }
    return pair;
}

struct Judge {
    std::map<std::string, uint64_t> counts; // of judged pairs, by fault
    uint64_t numFirst = 0;                  // right causes that were named first
    uint64_t numNamed = 0;

    // Empty if everything is right; otherwise what is wrong.
    std::string Look(const PairOfCircuits& pair, const Comparison& comparison);

  private:
    std::string LookAtDifference(const PairOfCircuits& pair, const Comparison& comparison);
};

std::string Judge::LookAtDifference(const PairOfCircuits& pair, const Comparison& comparison)
{
    if (comparison.Different().size() != 1)
        return std::to_string(comparison.Different().size()) + " tables differ, not one";
    if (comparison.Different()[0].left != pair.table)
        return "another table differs";
    const Difference difference = comparison.Describe(comparison.Different()[0]);
    const CauseCode code = CodeOf(pair.fault);
    for (const Cause& cause : difference.causes) {
        if (cause.code != code && !StandsFor(cause.code, pair.fault))
            continue;
        ++numNamed;
        numFirst += &cause == &difference.causes.front() ? 1 : 0;
        ++counts[CauseWord(code)];
        return std::string();
    }
    std::string named;
    for (const Cause& cause : difference.causes)
        named += std::string(" ") + CauseWord(cause.code);
    return std::string("the cause ") + CauseWord(code) + " is not named, but" + named;
}

std::string Judge::Look(const PairOfCircuits& pair, const Comparison& comparison)
{
    const size_t numLeft = comparison.Pairs().onlyLeft.size();
    const size_t numRight = comparison.Pairs().onlyRight.size();
    if (numLeft != (pair.fault == Fault::Missing ? 1u : 0u))
        return "missing tables: " + std::to_string(numLeft);
    if (numRight != (pair.fault == Fault::Added ? 1u : 0u))
        return "added tables: " + std::to_string(numRight);
    if (IsOfOneTable(pair.fault) &&
        !IsSameFunction(pair.left.tables[pair.table], pair.right.tables[pair.table]))
        return LookAtDifference(pair, comparison);
    if (!comparison.Different().empty())
        return "equal tables differ";
    const bool isRenamed = pair.fault == Fault::NetRenamed;
    if ((comparison.NumRenamed() > 0) != isRenamed ||
        comparison.RenamedNets().size() != (isRenamed ? 1u : 0u))
        return "renamed nets: " + std::to_string(comparison.RenamedNets().size());
    ++counts[isRenamed ? "net-renamed" : numLeft + numRight > 0 ? "one-sided" : "equal"];
    return std::string();
}

bool ReadBoth(const std::string& leftText, const std::string& rightText, Design& left,
              Design& right)
{
    std::string fault;
    ReadOptions options;
    options.keyAttribute = "place";
    const bool isRead = ReadDesignText(leftText, "left", options, left, fault) &&
                        ReadDesignText(rightText, "right", options, right, fault);
    if (!isRead)
        std::printf("%s\n", fault.c_str());
    return isRead;
}

// Pairs matched by names; in half of the right netlists the tables have other paths.
bool TestPair(uint64_t seed, Judge& judge)
{
    Random random(seed);
    PairOfCircuits pair = MakePair(random);
    if (Pick(random, 2) == 0)
        for (CircuitTable& table : pair.right.tables)
            table.name = pair.fault == Fault::NetRenamed ? table.name : "other_" + table.name;
    const std::string leftText = WriteJson(pair.left, "place");
    const std::string rightText = WriteJson(pair.right, "place");
    Design left;
    Design right;
    if (!ReadBoth(leftText, rightText, left, right))
        return false;
    const Comparison comparison(left, right, CompareOptions());
    const std::string wrong = judge.Look(pair, comparison);
    if (wrong.empty())
        return true;
    std::printf("seed %llu: %s\n%s%s", static_cast<unsigned long long>(seed), wrong.c_str(),
                leftText.c_str(), rightText.c_str());
    return false;
}

// The right netlist has other names everywhere, and places: equal pairs must compare as the same;
// in damaged ones the table must be found if no order of its pins hides the fault.
bool TestNameless(uint64_t seed, Judge& judge)
{
    Random random(seed);
    Circuit left = MakeCircuit(random);
    Circuit right = left;
    for (CircuitTable& table : right.tables) {
        Disguise(table, right, true, random);
        table.name = "cell" + std::to_string(Pick(random, 1000000)) + table.name;
    }
    const size_t spoilt = Pick(random, right.tables.size());
    const bool isSpoilt = Pick(random, 2) == 0;
    // Changes the parity of the number of rows that are 1: no order of pins does that.
    if (isSpoilt)
        right.tables[spoilt].rows[Pick(random, right.tables[spoilt].rows.size())].flip();
    const bool isEqual = IsSameFunction(left.tables[spoilt], right.tables[spoilt]);
    for (std::string& net : right.nets)
        net = "n" + std::to_string(Pick(random, 1000)) + "_" + net;
    std::shuffle(right.tables.begin(), right.tables.end(), random);
    const std::string leftText = WriteJson(left, "place");
    const std::string rightText = WriteJson(right, "place");
    Design leftDesign;
    Design rightDesign;
    if (!ReadBoth(leftText, rightText, leftDesign, rightDesign))
        return false;
    const Comparison comparison(leftDesign, rightDesign, CompareOptions());
    const std::vector<TablePair>& different = comparison.Different();
    const bool isFound =
        std::any_of(different.begin(), different.end(),
                    [spoilt](const TablePair& pair) { return pair.left == spoilt; });
    const bool isRight = comparison.AreNamesGone() && comparison.Pairs().onlyLeft.empty() &&
                         (isEqual ? different.empty() : isFound);
    ++judge.counts[isEqual ? "nameless, equal" : "nameless, spoilt"];
    if (!isRight)
        std::printf("seed %llu, nameless: %zu differ\n%s%s", static_cast<unsigned long long>(seed),
                    different.size(), leftText.c_str(), rightText.c_str());
    return isRight;
}

} // namespace

int main(int argc, char** argv)
{
    const uint64_t count = argc > 1 ? std::strtoull(argv[1], nullptr, 10) : 10000;
    const uint64_t firstSeed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1;
    Judge judge;
    uint64_t numWrong = 0;
    for (uint64_t seed = firstSeed; seed < firstSeed + count && numWrong < 3; ++seed)
        numWrong += (seed % 5 == 0 ? TestNameless(seed, judge) : TestPair(seed, judge)) ? 0 : 1;
    for (const auto& number : judge.counts)
        std::printf("%8llu  %s\n", static_cast<unsigned long long>(number.second),
                    number.first.c_str());
    std::printf("%llu pairs, seeds from %llu; %llu causes named, %llu of them first; %llu wrong\n",
                static_cast<unsigned long long>(count), static_cast<unsigned long long>(firstSeed),
                static_cast<unsigned long long>(judge.numNamed),
                static_cast<unsigned long long>(judge.numFirst),
                static_cast<unsigned long long>(numWrong));
    return numWrong == 0 ? 0 : 1;
}
