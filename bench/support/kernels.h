// Column kernels, compiled once for each instruction set.
#ifndef BENCH_KERNELS_H
#define BENCH_KERNELS_H

#include <cstddef>
#include <cstdint>

namespace bench {

// Kernels of one formula, for blocks of 16, 32 and 64 words. The larger the block, the more of the
// formula changes inside it; the smaller, the more often the rest is computed again.
constexpr size_t kNumBlockSizes = 3;
typedef void (*const KernelRow[kNumBlockSizes])(uint64_t* words);

namespace plain {
extern const KernelRow kKernels[];
}
namespace avx2 {
extern const KernelRow kKernels[];
}
namespace avx512 {
extern const KernelRow kKernels[];
}

} // namespace bench

#endif
