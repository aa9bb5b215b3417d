// Makes a network of a table of products. It accepts what a network can hold: one output, names for
// everything, no don't-cares.
// Fails: false, and 'network' is unchanged.  Cost: linear in the text.
#include <numeric>

#include "network_builder.h"
#include "pla.h"

namespace booleq {

bool ReadPla(const std::string& text, Network& network)
{
    Pla table;
    PlaFault fault;
    if (!ReadPla(text, table, fault))
        return false;
    const bool areZerosLeftOut = table.type == PlaType::F || table.type == PlaType::Fd;
    if (table.outputs.size() != 1 || !table.hasInputNames || !table.hasOutputNames ||
        !areZerosLeftOut || !table.free.IsEmpty())
        return false;
    NetworkBuilder builder;
    for (const std::string& input : table.inputs)
        if (!builder.AddInput(input))
            return false;
    if (!builder.AddSignal(table.outputs[0]))
        return false;
    std::vector<uint32_t> inputs(table.inputs.size());
    std::iota(inputs.begin(), inputs.end(), 0u);
    SumOfRows rows;
    for (size_t index = 0; index < table.on.Size(); ++index) {
        const std::string row = CubeText(table.space, table.on.At(index));
        if (!rows.Add(row.substr(0, inputs.size()), inputs))
            return false;
    }
    builder.DefineLast(rows.Take());
    return builder.Take(table.outputs[0], network);
}

} // namespace booleq
