#include "bit_orders.h"

#include <algorithm>
#include <cassert>

#include "text.h"

namespace booleq {

namespace {

// Two columns; the digits of the second are made when those of the first are written.
void PutBoth(const char* label, const Function& msb, const Function& lsb, size_t width,
             std::string (Function::*digits)() const, Output& output)
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

void PutBitOrders(const Function& msb, const Function& lsb, Output& output)
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
    PutBoth("hexadecimal", msb, lsb, width, &Function::Hex, output);
    PutBoth("binary", msb, lsb, width, &Function::Binary, output);
}

Json LsbFirstJson(const Function& function)
{
    const Function reversed = function.Reversed();
    return {{"hex", reversed.Hex()}, {"binary", reversed.Binary()}};
}

} // namespace booleq
