#include "bit_orders.h"

#include <algorithm>
#include <cassert>

#include <kq_logic/permute.h>

#include "text.h"

namespace booleq {

namespace {

// Two columns; the digits of the second are made only after those of the first are written.
void PutBoth(const char* label, const kq_logic::Function& msb, const kq_logic::Function& lsb,
             size_t width, std::string (kq_logic::Function::*digits)() const, Output& output)
{
    PutLabel(output, label);
    {
        const std::string first = (msb.*digits)();
        output.Put(first);
        output.Put(std::string(std::max(width, first.size()) - first.size() + 2, ' '));
    }
    output.Put((lsb.*digits)());
    output.Put("\n");
}

} // namespace

kq_logic::Function Reversed(const kq_logic::Function& function)
{
    std::vector<std::string> inputs = function.Inputs();
    std::reverse(inputs.begin(), inputs.end());
    kq_logic::Function reversed;
    const std::string fault = kq_logic::Permute(function, inputs, reversed);
    assert(fault.empty());
    static_cast<void>(fault);
    return reversed;
}

void PutBitOrders(const kq_logic::Function& msb, const kq_logic::Function& lsb, Output& output)
{
    assert(msb.NumInputs() >= 1);
    assert(msb.NumInputs() == lsb.NumInputs());
    if (msb.NumInputs() == 1) {
        PutField(output, "hexadecimal", msb.Hex());
        PutField(output, "binary", msb.Binary());
        return;
    }
    const std::string name = Visible(msb.Inputs().front());
    const std::string first = name + " most significant";
    // Longer digits are not aligned.
    const size_t width = std::max<size_t>(first.size(), std::min<size_t>(34, 2 + msb.NumRows()));
    PutLabel(output, "");
    output.Put(first + std::string(width - first.size() + 2, ' ') + name +
               " least (--lsb-first)\n");
    PutBoth("hexadecimal", msb, lsb, width, &kq_logic::Function::Hex, output);
    PutBoth("binary", msb, lsb, width, &kq_logic::Function::Binary, output);
}

Json LsbFirstJson(const kq_logic::Function& function)
{
    const kq_logic::Function reversed = Reversed(function);
    return {{"hex", reversed.Hex()}, {"binary", reversed.Binary()}};
}

} // namespace booleq
