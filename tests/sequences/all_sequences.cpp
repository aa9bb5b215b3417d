// Every sequence of tokens up to a length, library against the reference model, with a process for
// each processor. It takes long; the tests that always run have the shorter sequences.
// usage: all_sequences [SET]
// Exit status: 1 if a text is treated differently, if the numbers differ, or if SET is unknown.
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <vector>

#include <sys/wait.h>
#include <unistd.h>

#include "support/equation_compare.h"

namespace {

typedef std::vector<std::string> Texts;

struct Counts {
    uint64_t numAccepted;
    uint64_t numRefused;
    uint64_t numDifferences;
};

struct Set {
    const char* name;
    Texts alphabet;
    const char* separator;
    size_t maxLength;
    uint64_t numAccepted; // expected
};

const Texts kSpellings = {"&",  "*",  ".AND.", "|",     "+",  ".OR.", "^",      "@",     ".XOR.",
                          "~&", "!&", "~*",    "!*",    "~|", "!|",   ".NAND.", "~+",    "!+",
                          "~^", "!^", "~@",    ".NOR.", "!@", "~",    ".NXOR.", ".NOT.", "!",
                          "(",  ")",  "0",     "1",     "A",  "_b2",  "'c d'"};

// One spelling of each type of token; two names with two binary operators; all spellings, in fours,
// so that each comes before and after every other in many places.
const std::vector<Set> kSets = {
    {"types", {"A", "0", "1", "~", "(", ")", "&", "|", "^", "~&", "~|", "~^"}, " ", 8, 334273},
    {"names", {"A", "B", "~", "(", ")", "&", "|"}, " ", 8, 10961},
    {"spellings", kSpellings, " ", 4, 6525},
    {"spellings without blanks", kSpellings, "", 4, 8821},
};

// Checks every sequence of one length for which the number of its first three tokens, modulo
// 'numWorkers', is 'worker'.
class Worker {
  public:
    Worker(const Set& set, size_t worker, size_t numWorkers)
        : m_set(set), m_worker(worker), m_num_workers(numWorkers)
    {
    }

    Counts Run()
    {
        for (size_t length = 1; length <= m_set.maxLength; ++length)
            RunLength(length);
        return m_counts;
    }

  private:
    void RunLength(size_t length)
    {
        const size_t numTokens = m_set.alphabet.size();
        std::vector<size_t> digits(length, 0);
        for (;;) {
            size_t prefix = 0;
            for (size_t position = 0; position < 3 && position < length; ++position)
                prefix = prefix * numTokens + digits[position];
            if (prefix % m_num_workers == m_worker)
                Check(digits);
            else if (length > 3)
                std::fill(digits.begin() + 3, digits.end(), numTokens - 1);
            size_t position = length;
            while (position > 0 && ++digits[position - 1] == numTokens)
                digits[--position] = 0;
            if (position == 0)
                return;
        }
    }

    void Check(const std::vector<size_t>& digits)
    {
        m_text.clear();
        for (const size_t digit : digits) {
            if (!m_text.empty())
                m_text += m_set.separator;
            m_text += m_set.alphabet[digit];
        }
        const std::string difference = support::CompareSet(m_text, m_model, m_library, m_capture);
        ++(!m_model ? m_counts.numRefused : m_counts.numAccepted);
        if (difference.empty())
            return;
        if (++m_counts.numDifferences <= 3)
            std::printf("\"%s\": %s\n", support::Printable(m_text).c_str(), difference.c_str());
    }

    const Set& m_set;
    size_t m_worker;
    size_t m_num_workers;
    support::Capture m_capture;
    reference::Equation m_model;
    Kq_BoolEquationImp m_library;
    std::string m_text;
    Counts m_counts = {0, 0, 0};
};

// The sum of the counts of all workers; a worker that ends in any other way counts as a difference.
Counts RunAll(const Set& set, size_t numWorkers)
{
    int ends[2];
    if (pipe(ends) != 0)
        std::abort();
    std::fflush(stdout);
    for (size_t worker = 0; worker < numWorkers; ++worker) {
        if (fork() == 0) {
            const Counts counts = Worker(set, worker, numWorkers).Run();
            std::fflush(stdout);
            _exit(write(ends[1], &counts, sizeof counts) == sizeof counts ? 0 : 1);
        }
    }
    close(ends[1]);
    Counts sum = {0, 0, 0};
    Counts counts;
    size_t numReports = 0;
    while (read(ends[0], &counts, sizeof counts) == sizeof counts) {
        sum.numAccepted += counts.numAccepted;
        sum.numRefused += counts.numRefused;
        sum.numDifferences += counts.numDifferences;
        ++numReports;
    }
    close(ends[0]);
    while (wait(nullptr) > 0) {
    }
    sum.numDifferences += numWorkers - numReports;
    return sum;
}

bool IsAsExpected(const Set& set, const Counts& counts)
{
    uint64_t numSequences = 0;
    uint64_t numOfLength = 1;
    for (size_t length = 1; length <= set.maxLength; ++length) {
        numOfLength *= set.alphabet.size();
        numSequences += numOfLength;
    }
    return counts.numDifferences == 0 && counts.numAccepted + counts.numRefused == numSequences &&
           counts.numAccepted == set.numAccepted;
}

} // namespace

int main(int argc, char** argv)
{
    const size_t numWorkers = static_cast<size_t>(sysconf(_SC_NPROCESSORS_ONLN));
    bool isGood = true;
    bool isKnown = false;
    for (const Set& set : kSets) {
        if (argc > 1 && std::strcmp(argv[1], set.name) != 0)
            continue;
        isKnown = true;
        const std::time_t start = std::time(nullptr);
        const Counts counts = RunAll(set, numWorkers);
        const bool isAsExpected = IsAsExpected(set, counts);
        std::printf("%s, up to %zu tokens: accepted %llu, refused %llu, different %llu, "
                    "%ld s with %zu processes%s\n",
                    set.name, set.maxLength, static_cast<unsigned long long>(counts.numAccepted),
                    static_cast<unsigned long long>(counts.numRefused),
                    static_cast<unsigned long long>(counts.numDifferences),
                    static_cast<long>(std::time(nullptr) - start), numWorkers,
                    isAsExpected ? "" : ": not as expected");
        isGood = isGood && isAsExpected;
    }
    return isGood && isKnown ? 0 : 1;
}
