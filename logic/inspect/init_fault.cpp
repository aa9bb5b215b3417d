#include "init_fault.h"

#include "text.h"

namespace booleq {

namespace {

// Moves rows: row k comes from row source(k); kNoRow gives a 0.
Rows MoveRows(const Rows& rows, const std::function<uint64_t(uint64_t)>& source)
{
    Rows moved(rows.NumInputs());
    for (uint64_t row = 0; row < rows.NumRows(); ++row) {
        const uint64_t from = source(row);
        if (from != Rows::kNoRow && rows.At(from))
            moved.Set(row, true);
    }
    return moved;
}

Rows ShiftUp(const Rows& rows, uint64_t distance)
{
    return MoveRows(rows,
                    [=](uint64_t row) { return row < distance ? Rows::kNoRow : row - distance; });
}

Rows ShiftDown(const Rows& rows, uint64_t distance)
{
    const uint64_t numRows = rows.NumRows();
    return MoveRows(rows, [=](uint64_t row) {
        return row + distance < numRows ? row + distance : Rows::kNoRow;
    });
}

Rows RotateUp(const Rows& rows, uint64_t distance)
{
    const uint64_t numRows = rows.NumRows();
    return MoveRows(rows, [=](uint64_t row) { return (row + numRows - distance) % numRows; });
}

Rows DropFirst(const Rows& rows, uint64_t numKept)
{
    return MoveRows(rows, [=](uint64_t row) { return row < numKept ? row : Rows::kNoRow; });
}

// Puts the last group of so many rows first, and so on.
Rows ReverseGroups(const Rows& rows, uint64_t group)
{
    const uint64_t numGroups = rows.NumRows() / group;
    return MoveRows(
        rows, [=](uint64_t row) { return (numGroups - 1 - row / group) * group + row % group; });
}

void AddDigitFaults(uint64_t numRows, uint64_t digit, const char* noun,
                    std::vector<InitFault>& faults)
{
    const uint64_t numDigits = numRows / digit;
    for (uint64_t count = 1; count < numDigits; ++count) {
        const uint64_t distance = count * digit;
        const std::string by = Count(count, noun);
        faults.push_back({CauseCode::DigitsShifted, by + " to the left, filled with zeros",
                          [=](const Rows& rows) { return ShiftUp(rows, distance); }, nullptr});
        faults.push_back({CauseCode::DigitsShifted, by + " to the right, filled with zeros",
                          [=](const Rows& rows) { return ShiftDown(rows, distance); }, nullptr});
        // A rotation by half is the exchange of halves; beyond half, the other direction is
        // shorter.
        if (2 * distance < numRows) {
            const auto left = [=](const Rows& rows) { return RotateUp(rows, distance); };
            const auto right = [=](const Rows& rows) { return RotateUp(rows, numRows - distance); };
            faults.push_back({CauseCode::DigitsRotated, by + " to the left", left, right});
            faults.push_back({CauseCode::DigitsRotated, by + " to the right", right, left});
        }
        faults.push_back(
            {CauseCode::DigitsLost,
             "the first " + by + (count == 1 ? " is" : " are") + " lost and replaced by zeros",
             [=](const Rows& rows) { return DropFirst(rows, numRows - distance); }, nullptr});
    }
    if (numDigits > 1) {
        const auto reverse = [=](const Rows& rows) { return ReverseGroups(rows, digit); };
        faults.push_back({CauseCode::DigitsReversed, std::string(noun) + "s, the last one first",
                          reverse, reverse});
    }
}

} // namespace

std::vector<InitFault> InitFaults(unsigned int numInputs)
{
    const uint64_t numRows = uint64_t(1) << numInputs;
    const auto invert = [](const Rows& rows) { return ~rows; };
    std::vector<InitFault> faults = {{CauseCode::OutputInverted, "", invert, invert}};
    if (numInputs > 2)
        faults.push_back({CauseCode::BitOrder,
                          "the first pin is most significant in one, least in the other",
                          ReverseInputs, ReverseInputs});
    for (unsigned int input = 0; input < numInputs; ++input) {
        const auto turn = [=](const Rows& rows) { return InvertInput(rows, input); };
        faults.push_back({input == 0 ? CauseCode::HalvesExchanged : CauseCode::InputInverted, "",
                          turn, turn, static_cast<int>(input)});
    }
    constexpr uint64_t kMaxDigits = 64;
    constexpr uint64_t kByteRows = 2 * uint64_t(kDigitRows);
    if (numRows >= kByteRows && numRows / kDigitRows <= kMaxDigits)
        AddDigitFaults(numRows, kDigitRows, "hexadecimal digit", faults);
    if (numRows >= 4 * kByteRows) { // reversing two bytes would be exchanging halves
        const auto reverse = [](const Rows& rows) { return ReverseGroups(rows, kByteRows); };
        faults.push_back(
            {CauseCode::DigitsReversed, "bytes, the last one first", reverse, reverse});
    }
    if (numRows <= kMaxDigits)
        AddDigitFaults(numRows, 1, "binary digit", faults);
    return faults;
}

} // namespace booleq
