#include "cause_text.h"

#include "text.h"

namespace booleq {

namespace {

std::string NamesOf(const Comparison& comparison, const std::vector<NetId>& nets, size_t begin,
                    size_t end)
{
    std::vector<std::string> names;
    for (size_t place = begin; place < end; ++place)
        names.push_back(comparison.NameOf(nets[place]));
    return Join(names, ", ");
}

} // namespace

std::string CauseText(const Comparison& comparison, const Cause& cause)
{
    const std::vector<NetId>& nets = cause.nets;
    const std::string first = nets.empty() ? "" : comparison.NameOf(nets.front());
    const std::string detail = cause.detail.empty() ? "" : ": " + cause.detail;
    switch (cause.code) {
    case CauseCode::OutputInverted:
        return "the output is inverted";
    case CauseCode::PinsSwapped: {
        const size_t half = nets.size() / 2;
        return "pins swapped without the init value: " +
               (nets.size() == 4 ? first + " and " + comparison.NameOf(nets[1])
                                 : NamesOf(comparison, nets, 0, half) + " became " +
                                       NamesOf(comparison, nets, half, nets.size())) +
               (cause.detail.empty() ? "" : "; " + cause.detail);
    }
    case CauseCode::BitOrder:
        return "the init value is in the other bit order" + detail;
    case CauseCode::HalvesExchanged:
        return "the halves of the init value are exchanged, as if " + first + " were inverted";
    case CauseCode::InputInverted:
        return "the input " + first + " is inverted";
    case CauseCode::DigitsShifted:
        return "the digits of the init value are shifted" + detail;
    case CauseCode::DigitsRotated:
        return "the digits of the init value are rotated" + detail;
    case CauseCode::DigitsLost:
        return "the init value is shortened" + detail;
    case CauseCode::DigitsReversed:
        return "the digits of the init value are reversed" + detail;
    case CauseCode::DigitChanged:
        return "one digit of the init value changed" + detail;
    case CauseCode::OtherNet:
        return "an input comes from " + comparison.NameOf(nets[1]) + " instead of " + first;
    case CauseCode::InputStuck:
        return "the input " + first + " is taken as " + cause.detail;
    case CauseCode::OutputMoved:
        return "the same function drives " + comparison.NameOf(nets[1]) + " instead of " + first;
    }
    return std::string();
}

} // namespace booleq
