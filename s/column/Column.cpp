// Tree in, packed result column out. The leading variables are fixed one after another until the
// rest is a constant, has been written before, or is small enough for a kernel, which then computes
// it in a block that stays in the cache.
#include "Column.h"

#include <algorithm>
#include <cassert>
#include <cstring>

#include <port/Port_Env.h>

#include "JoinKernel.h"
#include "Kernel.h"
#include "ProgramWriter.h"

typedef Kq_BoolEquationImp::Node Node;

namespace {

// Blocks of up to 2^14 rows, 2 kB, are left to a kernel.
constexpr unsigned int kKernelLevel = 14;

// Larger blocks are not copied but expanded again: their first copy has left the cache.
constexpr unsigned int kMaxCopyLevel = 20;

// So many operations on words take some milliseconds.
constexpr uint64_t kPieceOperations = uint64_t(1) << 24;

size_t NumWords(unsigned int level)
{
    assert(level >= 6);
    return size_t(1) << (level - 6);
}

// The highest variable in a set that is not empty.
unsigned int HighestVariable(uint32_t variables)
{
    assert(variables != 0);
    unsigned int highest = 0;
    while (variables >>= 1)
        ++highest;
    return highest;
}

// Repeats the first 'numWords' words until there are 'totalWords', a multiple of them.
void Repeat(size_t numWords, size_t totalWords, uint64_t* words)
{
    assert(totalWords % numWords == 0);
    // Short pieces are doubled, long ones copied from the first, which is still in the cache.
    constexpr size_t kLongPiece = 2048;
    while (numWords < totalWords && numWords < kLongPiece) {
        std::memcpy(words + numWords, words, numWords * sizeof(uint64_t));
        numWords *= 2;
    }
    for (size_t word = numWords; word < totalWords; word += numWords)
        std::memcpy(words + word, words, numWords * sizeof(uint64_t));
}

void RunPlain(const KqCode* codes, size_t numCodes, bool isInverted, size_t numWords,
              uint64_t* stack, uint64_t* words)
{
    RunTiles<Vectors<16>, 8>(codes, numCodes, isInverted, numWords, stack, words);
}

void JoinPlain(const KqJoin& join, uint64_t* words)
{
    JoinValues<Vectors<16>>(join, words);
}

bool IsAlwaysSupported()
{
    return true;
}

#if defined(KQ_HAS_X86_KERNELS)
bool IsAvx2Supported()
{
    return __builtin_cpu_supports("avx2") != 0;
}

bool IsAvx512Supported()
{
    return __builtin_cpu_supports("avx512f") != 0 && __builtin_cpu_supports("avx512vl") != 0;
}
#endif

const KqNamedKernel kKernels[] = {{"plain", RunPlain, JoinPlain, IsAlwaysSupported},
#if defined(KQ_HAS_X86_KERNELS)
                                  {"avx2", KqRunAvx2, KqJoinAvx2, IsAvx2Supported},
                                  {"avx512", KqRunAvx512, KqJoinAvx512, IsAvx512Supported}
#endif
};

} // namespace

const KqNamedKernel* KqGetKernels(size_t* numKernels)
{
    *numKernels = sizeof kKernels / sizeof kKernels[0];
    return kKernels;
}

const KqNamedKernel& KqChooseKernel(const char* name)
{
    const KqNamedKernel* best = kKernels;
    for (const KqNamedKernel& kernel : kKernels) {
        if (!kernel.isSupported())
            continue;
        if (name && std::strcmp(kernel.name, name) == 0)
            return kernel;
        best = &kernel;
    }
    assert(best->isSupported());
    return *best;
}

const KqNamedKernel& KqGetKernel()
{
    static const KqNamedKernel& kernel =
        KqChooseKernel(Port_Env::GetEnv("MAV_KQ_BOOL_EQUATION_KERNEL"));
    return kernel;
}

KqColumn::KqColumn(const Node* root, unsigned int numVariables)
    : m_num_words(numVariables > 6 ? size_t(1) << (numVariables - 6) : 1),
      m_kernel(KqGetKernel().run), m_joiner(KqGetKernel().join)
{
    assert(numVariables <= kKqMaxColumnVariables);
    KqProgram program = KqCompile(root, numVariables, true);
    m_codes.swap(program.codes);
    m_num_codes = program.numCodes;
    m_whole = Describe(0, m_num_codes, program.isInverted);
    assert(m_whole.variables >> numVariables == 0);
}

size_t KqColumn::GetNumPieceWords() const
{
    size_t numWords = m_num_words;
    while (numWords > NumWords(kKernelLevel) &&
           uint64_t(m_whole.numCodes) * numWords > kPieceOperations)
        numWords /= 2;
    return numWords;
}

void KqColumn::Fill(uint64_t firstWord, size_t numWords, uint64_t* words)
{
    assert(firstWord + numWords <= m_num_words);
    // The largest pieces that start at a multiple of their size.
    while (numWords > 0) {
        unsigned int level = 6;
        while (firstWord % NumWords(level + 1) == 0 && NumWords(level + 1) <= numWords)
            ++level;
        FillPiece(firstWord, level, words);
        firstWord += NumWords(level);
        words += NumWords(level);
        numWords -= NumWords(level);
    }
}

// Fixes the variables above the piece as its position says, mostly as for the previous piece.
void KqColumn::FillPiece(uint64_t firstWord, unsigned int level, uint64_t* words)
{
    ForgetWritten();
    size_t depth = 0;
    Rest rest = m_whole;
    while (rest.variables >> level != 0) {
        const unsigned int variable = HighestVariable(rest.variables);
        const bool value = (firstWord >> (variable - 6) & 1u) != 0;
        if (depth < m_path_length && m_path[depth].value == value) {
            assert(m_path[depth].variable == variable); // all above it is fixed alike
            rest = m_path[depth++].rest;
            continue;
        }
        m_num_codes = rest.first + rest.numCodes;
        rest = Fix(rest, variable, value);
        m_path[depth++] = Fixed{variable, value, rest};
        m_path_length = depth;
    }
    assert(depth <= sizeof m_path / sizeof m_path[0]);
    // What the previous piece had fixed below this depth is overwritten now.
    m_path_length = depth;
    m_num_codes = rest.first + rest.numCodes;
    Expand(rest, level, words);
}

// Calls itself through ExpandHalves, once for each variable and so at most 30 deep.
// NOLINTNEXTLINE(misc-no-recursion)
void KqColumn::Expand(const Rest& rest, unsigned int level, uint64_t* words)
{
    if (rest.numCodes == 0) {
        std::memset(words, rest.isInverted ? 0xff : 0, NumWords(level) * sizeof(uint64_t));
        return;
    }
    assert(rest.variables >> level == 0);
    // Above its own highest variable, the block repeats.
    const unsigned int ownLevel = std::max(HighestVariable(rest.variables) + 1, 6u);
    if (ownLevel <= kKernelLevel) {
        if (CopyWritten(rest, ownLevel, words))
            return Repeat(NumWords(ownLevel), NumWords(level), words);
        RunKernel(rest, ownLevel, words);
    } else if (!CopyWritten(rest, ownLevel, words) &&
               !m_joiner.Fill(m_codes.data() + rest.first, rest.numCodes, rest.isInverted, ownLevel,
                              words)) {
        ExpandHalves(rest, ownLevel, words);
    }
    m_written[rest.hash % kNumWritten] = Written{rest, ownLevel, m_generation, words};
    Repeat(NumWords(ownLevel), NumWords(level), words);
}

// NOLINTNEXTLINE(misc-no-recursion)
void KqColumn::ExpandHalves(const Rest& rest, unsigned int level, uint64_t* words)
{
    assert(level > kKernelLevel);
    // Rests stay in m_codes because they may come up again, up to a few times the program's size.
    const size_t limit = rest.first + rest.numCodes + 4 * m_whole.numCodes + 16384;
    for (const bool value : {false, true}) {
        if (m_num_codes > limit) {
            ForgetWritten();
            m_num_codes = rest.first + rest.numCodes;
        }
        const Rest half = Fix(rest, level - 1, value);
        Expand(half, level - 1, words + (value ? NumWords(level - 1) : 0));
    }
}

void KqColumn::RunKernel(const Rest& rest, unsigned int level, uint64_t* words)
{
    const KqCode* codes = m_codes.data() + rest.first;
    const size_t numWords = NumWords(level);
    if (numWords >= kKqTileWords) {
        m_kernel(codes, rest.numCodes, rest.isInverted, numWords, m_stack, words);
        return;
    }
    uint64_t tile[kKqTileWords];
    m_kernel(codes, rest.numCodes, rest.isInverted, kKqTileWords, m_stack, tile);
    std::memcpy(words, tile, numWords * sizeof(uint64_t));
}

// What is left of 'rest' when 'variable' is 'value'; its codes go after all others.
KqColumn::Rest KqColumn::Fix(const Rest& rest, unsigned int variable, bool value)
{
    if (m_codes.size() < m_num_codes + rest.numCodes)
        m_codes.resize(2 * m_num_codes + rest.numCodes);
    KqWriter writer(m_codes.data(), m_num_codes);
    KqValue hand = writer.PutConstant(false);
    KqValue stack[kKqMaxStack];
    KqValue* top = stack;
    const KqCode* const end = m_codes.data() + rest.first + rest.numCodes;
    for (const KqCode* next = end - rest.numCodes; next != end; ++next) {
        const KqCode action = KqActionOf(*next);
        const bool isFixed = KqVariableOf(*next) == variable;
        if (action >= kKqUnstack) {
            hand = writer.PutUnstack(KqKindOf(action), hand, *--top);
        } else if (action >= kKqCombine) {
            hand = isFixed ? writer.PutConstantOperand(KqKindOf(action), hand, value)
                           : writer.PutCombine(KqKindOf(action), hand, KqVariableOf(*next));
        } else {
            assert(top < stack + kKqMaxStack);
            *top++ = hand;
            hand = isFixed ? writer.PutConstant(value) : writer.PutVariable(KqVariableOf(*next));
        }
    }
    assert(top == stack + 1); // the first value at hand, which nothing takes
    assert(writer.GetEnd() <= m_num_codes + rest.numCodes);
    const size_t first = m_num_codes;
    m_num_codes = writer.GetEnd();
    const Rest left =
        Describe(first, m_num_codes - first, (hand.GetInversion() != 0) != rest.isInverted);
    assert((left.variables & ~rest.variables) == 0);
    assert((left.variables >> variable & 1u) == 0);
    return left;
}

KqColumn::Rest KqColumn::Describe(size_t first, size_t numCodes, bool isInverted) const
{
    assert(first + numCodes <= m_codes.size());
    Rest rest = {first, numCodes, 0, 0, isInverted};
    uint64_t sum = 0;
    const KqCode* codes = m_codes.data() + first;
    for (size_t position = 0; position < numCodes; ++position) {
        const KqCode code = codes[position];
        rest.variables |= (KqActionOf(code) < kKqUnstack ? 1u : 0u) << (KqVariableOf(code) & 31u);
        sum += (code + 1 + position * 64) * 0x9e3779b97f4a7c15u ^ (code * uint64_t(0x85ebca6b));
    }
    rest.hash = static_cast<uint32_t>(sum >> 32);
    return rest;
}

// Copies the block of 'rest' when the same one, or its complement, has been written.
bool KqColumn::CopyWritten(const Rest& rest, unsigned int level, uint64_t* words)
{
    if (level > kMaxCopyLevel)
        return false;
    Written& written = m_written[rest.hash % kNumWritten];
    if (written.generation != m_generation || written.level != level ||
        written.rest.numCodes != rest.numCodes ||
        std::memcmp(m_codes.data() + written.rest.first, m_codes.data() + rest.first,
                    rest.numCodes * sizeof(KqCode)) != 0)
        return false;
    assert(written.words);
    assert(written.rest.variables == rest.variables);
    if (written.rest.isInverted == rest.isInverted) {
        std::memcpy(words, written.words, NumWords(level) * sizeof(uint64_t));
    } else {
        for (size_t word = 0; word < NumWords(level); ++word)
            words[word] = ~written.words[word];
        written.rest.isInverted = rest.isInverted;
    }
    written.words = words; // the newest copy is the likeliest in the cache
    return true;
}
