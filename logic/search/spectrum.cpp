// The fast transform by Hadamard's matrix; see Hurst, Miller and Muzio, Spectral Techniques in
// Digital Logic, 1985, which also shows how inversions and orders of inputs change it.
#include "spectrum.h"

#include <cassert>
#include <cstddef>
#include <numeric>

namespace booleq {

namespace {

constexpr unsigned int kWordBits = 6;

// Differences by more and more inputs, from the highest bit of the row number down. A difference by
// one of the upper bits halves the words; one by the lower six keeps the rows in which that bit is
// 0.
class Derivatives {
  public:
    explicit Derivatives(std::vector<uint32_t>& weights) : m_weights(weights) {}

    // 'words' are differenced by 'set'; inputs below bit 'end' are still to come. The depth is the
    // number of inputs.
    void Run(const std::vector<uint64_t>& words, uint64_t rows, size_t set, unsigned int end)
    {
        if (set != 0)
            m_weights[set] = CountRows(words, rows);
        for (unsigned int bit = 0; bit < end; ++bit) {
            const size_t with = set | size_t(1) << bit;
            if (bit < kWordBits)
                Run(LowDifference(words, bit), rows & ~BitPattern(bit), with, bit);
            else
                Run(HighDifference(words, size_t(1) << (bit - kWordBits)), rows, with, bit);
        }
    }

  private:
    static uint32_t CountRows(const std::vector<uint64_t>& words, uint64_t rows)
    {
        return std::accumulate(
            words.begin(), words.end(), uint32_t(0), [rows](uint32_t sum, uint64_t word) {
                return sum + static_cast<uint32_t>(__builtin_popcountll(word & rows));
            });
    }

    static std::vector<uint64_t> LowDifference(std::vector<uint64_t> words, unsigned int bit)
    {
        for (uint64_t& word : words)
            word ^= word >> (1u << bit);
        return words;
    }

    static std::vector<uint64_t> HighDifference(const std::vector<uint64_t>& words, size_t block)
    {
        std::vector<uint64_t> result;
        result.reserve(words.size() / 2);
        for (size_t start = 0; start < words.size(); start += 2 * block)
            for (size_t word = start; word < start + block; ++word)
                result.push_back(words[word] ^ words[word + block]);
        return result;
    }

    std::vector<uint32_t>& m_weights;
};

} // namespace

std::vector<int32_t> WalshSpectrum(const Rows& rows)
{
    assert(rows.NumInputs() <= kMaxSpectrumInputs);
    const size_t numRows = rows.NumRows();
    std::vector<int32_t> spectrum(numRows);
    for (size_t row = 0; row < numRows; ++row)
        spectrum[row] = rows.At(row) ? -1 : 1;
    for (size_t half = 1; half < numRows; half *= 2)
        for (size_t start = 0; start < numRows; start += 2 * half)
            for (size_t low = start; low < start + half; ++low) {
                const int32_t sum = spectrum[low] + spectrum[low + half];
                spectrum[low + half] = spectrum[low] - spectrum[low + half];
                spectrum[low] = sum;
            }
    return spectrum;
}

std::vector<uint32_t> DerivativeWeights(const Rows& rows)
{
    assert(rows.NumInputs() <= kMaxSpectrumInputs);
    std::vector<uint32_t> weights(rows.NumRows());
    const std::vector<uint64_t> words(rows.Words(), rows.Words() + rows.Size());
    Derivatives(weights).Run(words, RowMask(rows.NumInputs()), 0, rows.NumInputs());
    return weights;
}

} // namespace booleq
