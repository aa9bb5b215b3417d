// The kernels of the result column for processors with AVX-512: 512 rows to a vector. Compiled for
// such processors, so nothing here may be called before the processor is known to be one.
#include "Kernel.h"

#include "JoinKernel.h"

void KqRunAvx512(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
                 uint64_t* stack, uint64_t* words)
{
    RunTiles<Vectors<64>, 8>(codes, numCodes, isInverted, numWords, stack, words);
}

void KqJoinAvx512(const KqJoin& join, uint64_t* words)
{
    JoinValues<Vectors<64>>(join, words);
}
