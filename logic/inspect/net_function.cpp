#include "net_function.h"

#include <algorithm>
#include <cassert>

#include "fold.h"
#include "function.h"

namespace booleq {

namespace {

// Removes input 'input' from rows that do not depend on it.
void DropInput(PinFunction& pins, unsigned int input)
{
    std::vector<unsigned int> rest;
    for (unsigned int other = 0; other < pins.rows.NumInputs(); ++other)
        if (other != input)
            rest.push_back(other);
    pins.rows = Restrict(std::move(pins.rows), rest);
    pins.nets.erase(pins.nets.begin() + input);
}

// Makes the rows independent of input 'second', which is the same net as 'first': rows in which the
// two differ are never reached.
Rows Merge(const Rows& rows, unsigned int first, unsigned int second)
{
    const Rows low = Cofactor(Cofactor(rows, first, false), second, false);
    const Rows high = Cofactor(Cofactor(rows, first, true), second, true);
    const Rows value = InputRows(rows.NumInputs(), first);
    return AndNot(low, value) | (high & value);
}

void FoldConstants(PinFunction& pins)
{
    for (unsigned int input = 0; input < pins.nets.size();) {
        const NetId net = pins.nets[input];
        if (net != kNetZero && net != kNetOne) {
            ++input;
            continue;
        }
        pins.rows = Cofactor(std::move(pins.rows), input, net == kNetOne);
        DropInput(pins, input);
    }
}

// Insertion sort by swapping neighbours: there are few inputs, and most are in order.
void SortNets(PinFunction& pins)
{
    for (size_t end = 1; end < pins.nets.size(); ++end)
        for (size_t place = end; place > 0 && pins.nets[place - 1] > pins.nets[place]; --place) {
            std::swap(pins.nets[place - 1], pins.nets[place]);
            pins.rows = SwapInputs(std::move(pins.rows), static_cast<unsigned int>(place - 1),
                                   static_cast<unsigned int>(place));
        }
}

void MergeEqualNets(PinFunction& pins)
{
    for (unsigned int input = 1; input < pins.nets.size();) {
        if (pins.nets[input] != pins.nets[input - 1]) {
            ++input;
            continue;
        }
        pins.rows = Merge(pins.rows, input - 1, input);
        DropInput(pins, input);
    }
}

void DropIdleNets(PinFunction& pins)
{
    const std::vector<unsigned int> support = Support(pins.rows);
    if (support.size() == pins.nets.size())
        return;
    std::vector<NetId> nets;
    nets.reserve(support.size());
    for (const unsigned int input : support)
        nets.push_back(pins.nets[input]);
    pins.rows = Restrict(std::move(pins.rows), support);
    pins.nets = std::move(nets);
}

} // namespace

bool operator==(const NetFunction& left, const NetFunction& right)
{
    return left.nets == right.nets && left.rows == right.rows;
}

NetFunction Normalise(PinFunction pins)
{
    assert(pins.nets.size() == pins.rows.NumInputs());
    FoldConstants(pins);
    SortNets(pins);
    MergeEqualNets(pins);
    DropIdleNets(pins);
    assert(std::is_sorted(pins.nets.begin(), pins.nets.end()));
    assert(pins.nets.size() == pins.rows.NumInputs());
    return {std::move(pins.rows), std::move(pins.nets)};
}

NetFunction Renumber(const NetFunction& function, const std::vector<NetId>& numbers)
{
    PinFunction pins = {function.rows, function.nets};
    for (NetId& net : pins.nets) {
        assert(net < numbers.size());
        net = numbers[net];
    }
    return Normalise(std::move(pins));
}

NetFunction Fix(const NetFunction& function, NetId net, bool value)
{
    return Replace(function, net, value ? kNetOne : kNetZero);
}

NetFunction Replace(const NetFunction& function, NetId net, NetId by)
{
    PinFunction pins = {function.rows, function.nets};
    std::replace(pins.nets.begin(), pins.nets.end(), net, by);
    return Normalise(std::move(pins));
}

std::string HexOf(const Rows& rows)
{
    std::vector<std::string> names; // their spelling does not matter, only their number
    for (unsigned int input = 0; input < rows.NumInputs(); ++input)
        names.push_back(std::to_string(input));
    return Function(std::move(names), rows).Hex();
}

PinFunction PinsOf(const Design& design, const DesignTable& table)
{
    PinFunction pins;
    pins.rows = TableRows(design, design.inits[table.init]);
    const NetId* const inputs = design.Inputs(table);
    // Designs count pins from the least significant, rows count inputs from the most significant.
    for (unsigned int input = design.NumInputs(table); input-- > 0;)
        pins.nets.push_back(inputs[input]);
    return pins;
}

std::vector<bool> FirstDifference(const NetFunction& left, const NetFunction& right,
                                  const std::vector<NetId>& order)
{
    assert(left != right);
    NetFunction restLeft = left;
    NetFunction restRight = right;
    std::vector<bool> values;
    for (const NetId net : order) {
        const NetFunction lowLeft = Fix(restLeft, net, false);
        const NetFunction lowRight = Fix(restRight, net, false);
        const bool isHigh = lowLeft == lowRight;
        restLeft = isHigh ? Fix(restLeft, net, true) : lowLeft;
        restRight = isHigh ? Fix(restRight, net, true) : lowRight;
        values.push_back(isHigh);
    }
    assert(restLeft.nets.empty() && restRight.nets.empty());
    assert(restLeft != restRight);
    return values;
}

bool ValueAt(const NetFunction& function, const std::vector<NetId>& order,
             const std::vector<bool>& values)
{
    assert(order.size() == values.size());
    uint64_t row = 0;
    for (const NetId net : function.nets) {
        const auto place = std::find(order.begin(), order.end(), net);
        assert(place != order.end());
        row = row << 1 | (values[static_cast<size_t>(place - order.begin())] ? 1u : 0u);
    }
    return function.rows.At(row);
}

} // namespace booleq
