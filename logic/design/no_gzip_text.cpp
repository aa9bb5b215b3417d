// Replaces gzip_text.cpp in a build without zlib.
#include "source_text.h"

#include "read_fault.h"

namespace booleq {

void SourceText::Inflate()
{
    throw ReadFault{"it is compressed, and this build was made without zlib; run gunzip first"};
}

} // namespace booleq
