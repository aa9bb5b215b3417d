// The kernels of the result column for processors with AVX2: 256 rows to a vector. Compiled for
// such processors, so nothing here may be called before the processor is known to be one.
#include "Kernel.h"

#include "JoinKernel.h"

void KqRunAvx2(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
               uint64_t* stack, uint64_t* words)
{
    RunTiles<Vectors<32>, 8>(codes, numCodes, isInverted, numWords, stack, words);
}

void KqJoinAvx2(const KqJoin& join, uint64_t* words)
{
    JoinValues<Vectors<32>>(join, words);
}
