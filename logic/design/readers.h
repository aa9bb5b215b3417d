// The readers of the formats. Each turns a text in memory into modules; names and init values go
// straight into the design.
// Fails: ReadFault with a line or a path.  Cost: one pass over the text.
#ifndef BOOLEQ_DESIGN_READERS_H
#define BOOLEQ_DESIGN_READERS_H

#include <string_view>
#include <vector>

#include "module_content.h"
#include "read_design.h"
#include "source_text.h"

namespace booleq {

// What all readers get: the file, the options, and the design that the names go into.
struct ReadJob {
    const SourceText& source;
    const ReadOptions& options;
    const CellTypes& cellTypes;
    Design& design;
    std::vector<ModuleContent>& modules;
};

void ReadYosysJson(const ReadJob& job);
void ReadBlifNetlist(const ReadJob& job);
void ReadEdif(const ReadJob& job);

// Removes the backslash that Yosys writes before a user's name that looks like one of its own.
inline std::string_view WithoutMark(std::string_view name)
{
    const bool isMarked = name.size() > 1 && name[0] == '\\' &&
                          (name[1] == '$' || name[1] == '\\' || (name[1] >= '0' && name[1] <= '9'));
    return isMarked ? name.substr(1) : name;
}

// Decides when to check for an interrupt, and reports progress.
class Pace {
  public:
    explicit Pace(const ReadJob& job) : m_job(job) {}
    // True once every few thousand calls.
    bool IsDue() { return ++m_num_calls % kEvery == 0; }
    // Calls Watch(), which may throw, and the progress callback if there is one.
    void Report(uint64_t numBytesDone) const;

  private:
    static constexpr uint32_t kEvery = 4096;

    const ReadJob& m_job;
    uint32_t m_num_calls = 0;
};

} // namespace booleq

#endif
