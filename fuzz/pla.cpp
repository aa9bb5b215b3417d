// The input is a PLA file: it is read, minimised and compared row by row with what its digits say.
// A file with more rows than can be gone through is only read.
#include "fuzz/target.h"
#include "sum.h"

namespace fuzz {

namespace {

constexpr size_t kMaxInputs = 8;
constexpr size_t kMaxOutputs = 6;
constexpr size_t kMaxCubes = 64;

bool HasRow(const booleq::Pla& table, const booleq::CubeList& cubes, size_t output, size_t row)
{
    for (size_t index = 0; index < cubes.Size(); ++index) {
        bool isIn = booleq::GetBit(cubes.At(index), table.space.OutputBit(output));
        for (size_t input = 0; input < table.inputs.size(); ++input)
            isIn = isIn && booleq::GetBit(cubes.At(index), 2 * input + (row >> input & 1));
        if (isIn)
            return true;
    }
    return false;
}

std::string CompareRows(const booleq::Pla& table, const booleq::CubeList& sum, bool isInverted)
{
    const bool isOffGiven = table.type == booleq::PlaType::Fr || table.type == booleq::PlaType::Fdr;
    for (size_t output = 0; output < table.outputs.size(); ++output) {
        for (size_t row = 0; row >> table.inputs.size() == 0; ++row) {
            const bool isOn = HasRow(table, table.on, output, row);
            const bool isFree = HasRow(table, table.free, output, row);
            const bool isOff =
                isOffGiven ? HasRow(table, table.off, output, row) : !isOn && !isFree;
            const bool value = HasRow(table, sum, output, row) != isInverted;
            if ((isOn && !isFree && !value) || (isOff && value))
                return "row " + std::to_string(row) + " of output " + std::to_string(output) +
                       " is wrong";
        }
    }
    return "";
}

} // namespace

std::string Describe(const std::string& input)
{
    return "PLA file of " + std::to_string(input.size()) + " bytes:\n" + input + "\n";
}

std::string Check(const std::string& input)
{
    booleq::Pla table;
    booleq::PlaFault fault;
    if (!ReadPla(input, table, fault))
        return fault.line > 0 && !fault.message.empty() ? "" : "refused without a line or a reason";
    if (table.inputs.size() > kMaxInputs || table.outputs.size() > kMaxOutputs ||
        table.numRows > kMaxCubes)
        return "";
    for (const bool isInverted : {false, true}) {
        booleq::SumOptions options;
        options.isExact = input.size() % 2 == 0;
        options.isInverted = isInverted;
        booleq::Sum sum(table.space);
        booleq::Work work;
        work.SetLimit(uint64_t(1) << 30);
        if (!Minimise(table, options, sum, fault, work))
            return fault.line > 0 ? "" : "a contradiction without a line";
        const std::string difference = CompareRows(table, sum.cubes, isInverted);
        if (!difference.empty())
            return difference;
        if (sum.lowerBound > sum.cost.numTerms)
            return "fewer terms than the bound";
    }
    return "";
}

} // namespace fuzz
