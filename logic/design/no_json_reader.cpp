// Replaces json_reader.cpp in a build without simdjson.
#include "read_fault.h"
#include "readers.h"

namespace booleq {

void ReadYosysJson(const ReadJob&)
{
    throw ReadFault{
        "this build was made without simdjson and cannot read JSON; write BLIF or EDIF"};
}

} // namespace booleq
