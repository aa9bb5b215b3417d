#include "cause.h"

#include <algorithm>
#include <cassert>

#include "function.h"
#include "init_fault.h"
#include "match.h"

namespace booleq {

namespace {

// The rows that an assignment of the nets can reach: constant pins have their value, and pins of
// the same net have equal values.
Rows ReachableRows(const std::vector<NetId>& nets)
{
    const auto numPins = static_cast<unsigned int>(nets.size());
    Rows reachable = ConstantRows(numPins, true);
    for (unsigned int pin = 0; pin < numPins; ++pin) {
        const Rows value = InputRows(numPins, pin);
        if (nets[pin] == kNetZero)
            reachable = AndNot(std::move(reachable), value);
        else if (nets[pin] == kNetOne)
            reachable = std::move(reachable) & value;
        else
            for (unsigned int other = 0; other < pin; ++other)
                if (nets[other] == nets[pin])
                    reachable = AndNot(std::move(reachable), value ^ InputRows(numPins, other));
    }
    return reachable;
}

// The digit that holds all changed rows; empty if there are several or none.
std::string ChangedDigit(const Rows& changed)
{
    const uint64_t first = FirstDifference(changed, ConstantRows(changed.NumInputs(), false));
    if (first == Rows::kNoRow)
        return std::string();
    const uint64_t digit = first / kDigitRows;
    const uint64_t end = std::min<uint64_t>(changed.NumRows(), (digit + 1) * kDigitRows);
    uint64_t numChanged = 0;
    for (uint64_t row = first; row < end; ++row)
        numChanged += changed.At(row) ? 1 : 0;
    if (numChanged != NumOnes(changed))
        return std::string();
    return numChanged == 1 ? "bit " + std::to_string(first)
                           : "hexadecimal digit " + std::to_string(digit) +
                                 ", counted from the last, which is 0";
}

class CauseFinder {
  public:
    CauseFinder(const PinFunction& left, const PinFunction& right)
        : m_left(left), m_right(right), m_left_function(Normalise(left)),
          m_right_function(Normalise(right))
    {
        assert(m_left_function != m_right_function);
        m_has_expected = RightRows(m_left_function, m_right, m_expected);
        m_reachable = ReachableRows(m_right.nets);
    }

    std::vector<Cause> Run()
    {
        FindInitFaults();
        FindSwappedPins();
        FindChangedDigit();
        FindOtherNet();
        FindOtherPin();
        DropWeaker();
        std::stable_sort(
            m_causes.begin(), m_causes.end(),
            [](const Cause& left, const Cause& right) { return left.code < right.code; });
        return std::move(m_causes);
    }

  private:
    // One cause of a kind is enough: a shift by a hexadecimal digit is also one by four binary
    // digits.
    bool IsKnown(CauseCode code) const
    {
        return std::any_of(m_causes.begin(), m_causes.end(),
                           [code](const Cause& cause) { return cause.code == code; });
    }

    // Whether the fault, applied to the left table's init value, gives the right one's function.
    bool LeadsToRight(const InitFault& fault) const
    {
        return Normalise({fault.apply(m_left.rows), m_left.nets}) == m_right_function;
    }

    // Whether the fault, undone in the right table's init value or applied to the value that it
    // should have, explains the difference.
    bool LeadsFromRight(const InitFault& fault) const
    {
        if (fault.undo && Normalise({fault.undo(m_right.rows), m_right.nets}) == m_left_function)
            return true;
        return m_has_expected && IsZero((fault.apply(m_expected) ^ m_right.rows) & m_reachable);
    }

    // Drops causes that say no more than another one: exchanged halves are an inverted input, and a
    // shift that loses only zeros is a rotation.
    void DropWeaker()
    {
        const bool hasShift = IsKnown(CauseCode::DigitsShifted);
        const bool hasHalves = IsKnown(CauseCode::HalvesExchanged);
        const auto isWeaker = [=](const Cause& cause) {
            return (cause.code == CauseCode::DigitsRotated && hasShift) ||
                   (cause.code == CauseCode::InputInverted && hasHalves);
        };
        m_causes.erase(std::remove_if(m_causes.begin(), m_causes.end(), isWeaker), m_causes.end());
    }

    void AddInitFault(const InitFault& fault, const PinFunction& pins)
    {
        Cause cause = {fault.code, {}, fault.detail};
        if (fault.input >= 0)
            cause.nets.push_back(pins.nets[static_cast<size_t>(fault.input)]);
        m_causes.push_back(std::move(cause));
    }

    // Tries the right table's pins first, because that table is the one being checked.
    void FindInitFaults()
    {
        for (const InitFault& fault : InitFaults(m_right.rows.NumInputs()))
            if (!IsKnown(fault.code) && LeadsFromRight(fault))
                AddInitFault(fault, m_right);
        for (const InitFault& fault : InitFaults(m_left.rows.NumInputs()))
            if (!IsKnown(fault.code) && LeadsToRight(fault))
                AddInitFault(fault, m_left);
    }

    // Tries two pins, including constant and idle ones, then any order of the pins that matter.
    void FindSwappedPins()
    {
        const size_t numPins = m_right.nets.size();
        for (size_t first = 0; first < numPins; ++first)
            for (size_t second = first + 1; second < numPins; ++second) {
                PinFunction pins = m_right;
                std::swap(pins.nets[first], pins.nets[second]);
                if (Normalise(std::move(pins)) != m_left_function)
                    continue;
                AddSwap({m_right.nets[second], m_right.nets[first]},
                        {m_right.nets[first], m_right.nets[second]});
                return;
            }
        if (m_left_function.nets == m_right_function.nets)
            FindPermutedPins();
    }

    void FindPermutedPins()
    {
        const std::vector<NetId>& nets = m_left_function.nets;
        if (nets.size() < 2 || nets.size() > kMaxMatchInputs)
            return;
        std::vector<std::string> names; // arbitrary: only places count
        for (size_t place = 0; place < nets.size(); ++place)
            names.push_back("n" + std::to_string(place));
        constexpr double kSeconds = 1; // for one table; hard ones get no such cause
        const Function left(names, m_left_function.rows);
        const Matching matching =
            Match(left, Function(names, m_right_function.rows), false, kSeconds);
        if (!matching.isFound)
            return;
        std::vector<NetId> taken;
        std::vector<NetId> takenFor;
        for (size_t place = 0; place < nets.size(); ++place) {
            const NetId source = nets[matching.sources[place]];
            if (source == nets[place])
                continue;
            taken.push_back(source);
            takenFor.push_back(nets[place]);
        }
        AddSwap(taken, takenFor);
    }

    void AddSwap(std::vector<NetId> nets, const std::vector<NetId>& takenFor)
    {
        nets.insert(nets.end(), takenFor.begin(), takenFor.end());
        const bool isSameInit = m_left.rows == m_right.rows && m_left.nets != m_right.nets;
        m_causes.push_back(
            {CauseCode::PinsSwapped, std::move(nets),
             isSameInit ? "the pins changed their order, the init value did not change" : ""});
    }

    // Compares over the right table's pins. If that finds nothing, compares over the left one's,
    // which helps if the right one has idle pins.
    void FindChangedDigit()
    {
        Rows other;
        std::string detail;
        if (m_has_expected)
            detail = ChangedDigit((m_expected ^ m_right.rows) & m_reachable);
        if (detail.empty() && RightRows(m_right_function, m_left, other))
            detail = ChangedDigit((other ^ m_left.rows) & ReachableRows(m_left.nets));
        if (!detail.empty())
            m_causes.push_back({CauseCode::DigitChanged, {}, detail});
    }

    // Finds a net that is replaced by another one, or by a constant, in the whole function.
    void FindOtherNet()
    {
        std::vector<NetId> gone;
        std::set_difference(m_left_function.nets.begin(), m_left_function.nets.end(),
                            m_right_function.nets.begin(), m_right_function.nets.end(),
                            std::back_inserter(gone));
        if (gone.size() != 1)
            return;
        std::vector<NetId> candidates = m_right_function.nets;
        candidates.insert(candidates.end(), {kNetZero, kNetOne});
        for (const NetId net : candidates)
            if (Replace(m_left_function, gone.front(), net) == m_right_function)
                AddOtherNet(gone.front(), net);
    }

    // Finds one wrong pin of the right table if its net has several pins, or the pin is constant or
    // idle.
    void FindOtherPin()
    {
        std::vector<NetId> candidates = m_left.nets;
        candidates.insert(candidates.end(), m_right.nets.begin(), m_right.nets.end());
        candidates.insert(candidates.end(), {kNetZero, kNetOne});
        for (size_t pin = 0; pin < m_right.nets.size(); ++pin)
            for (const NetId net : candidates) {
                PinFunction pins = m_right;
                pins.nets[pin] = net;
                if (Normalise(std::move(pins)) == m_left_function)
                    AddOtherNet(net, m_right.nets[pin]);
            }
    }

    void AddOtherNet(NetId before, NetId after)
    {
        const bool isStuck = after == kNetZero || after == kNetOne;
        const CauseCode code = isStuck ? CauseCode::InputStuck : CauseCode::OtherNet;
        if (IsKnown(code))
            return;
        if (isStuck)
            m_causes.push_back({code, {before}, after == kNetOne ? "1" : "0"});
        else
            m_causes.push_back({code, {before, after}, ""});
    }

    const PinFunction& m_left;
    const PinFunction& m_right;
    NetFunction m_left_function;
    NetFunction m_right_function;
    Rows m_expected;  // the right one's init value if it had the left one's function
    Rows m_reachable; // of the right table; see ReachableRows
    bool m_has_expected = false;
    std::vector<Cause> m_causes;
};

} // namespace

const char* CauseWord(CauseCode code)
{
    switch (code) {
    case CauseCode::OutputInverted:
        return "output-inverted";
    case CauseCode::PinsSwapped:
        return "pins-swapped";
    case CauseCode::BitOrder:
        return "bit-order";
    case CauseCode::HalvesExchanged:
        return "halves-exchanged";
    case CauseCode::InputInverted:
        return "input-inverted";
    case CauseCode::DigitsShifted:
        return "digits-shifted";
    case CauseCode::DigitsRotated:
        return "digits-rotated";
    case CauseCode::DigitsLost:
        return "digits-lost";
    case CauseCode::DigitsReversed:
        return "digits-reversed";
    case CauseCode::DigitChanged:
        return "digit-changed";
    case CauseCode::OtherNet:
        return "other-net";
    case CauseCode::InputStuck:
        return "input-stuck";
    case CauseCode::OutputMoved:
        return "output-moved";
    }
    return "";
}

std::vector<Cause> FindCauses(const PinFunction& left, const PinFunction& right)
{
    return CauseFinder(left, right).Run();
}

bool RightRows(const NetFunction& left, const PinFunction& right, Rows& rows)
{
    // Each net of the function takes the first pin that has it.
    const auto numPins = static_cast<unsigned int>(right.nets.size());
    std::vector<unsigned int> pinOf;
    for (const NetId net : left.nets) {
        const auto found = std::find(right.nets.begin(), right.nets.end(), net);
        if (found == right.nets.end())
            return false;
        pinOf.push_back(static_cast<unsigned int>(found - right.nets.begin()));
    }
    Rows result = left.rows;
    std::vector<unsigned int> order = pinOf; // Widen puts new inputs in front
    std::vector<unsigned int> others;
    for (unsigned int pin = 0; pin < numPins; ++pin)
        if (std::find(pinOf.begin(), pinOf.end(), pin) == pinOf.end())
            others.push_back(pin);
    for (size_t count = 0; count < others.size(); ++count)
        result = Widen(result);
    order.insert(order.begin(), others.begin(), others.end());
    // places[k] is the input of 'result' for pin k.
    std::vector<unsigned int> places(numPins);
    for (unsigned int place = 0; place < numPins; ++place)
        places[order[place]] = place;
    rows = PermuteInputs(std::move(result), places);
    assert(Normalise({rows, right.nets}).rows == left.rows);
    return true;
}

} // namespace booleq
