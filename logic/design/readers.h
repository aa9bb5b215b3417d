// The readers of the formats. Each takes a text that is in memory and gives modules; names and init
// values go into the design at once.
// Throw ReadFault with a line or a path.  Cost: one pass over the text.
#ifndef BOOLEQ_DESIGN_READERS_H
#define BOOLEQ_DESIGN_READERS_H

#include <string_view>
#include <vector>

#include "module_content.h"
#include "read_design.h"
#include "source_text.h"

namespace booleq {

// What the readers share: the file, what is asked of it, and the design that names go to.
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

// Yosys writes a backslash before a name of the design that looks like one of its own.
inline std::string_view WithoutMark(std::string_view name)
{
    const bool isMarked = name.size() > 1 && name[0] == '\\' &&
                          (name[1] == '$' || name[1] == '\\' || (name[1] >= '0' && name[1] <= '9'));
    return isMarked ? name.substr(1) : name;
}

// Says when it is time to look whether somebody wants the work to end, and tells how far it is.
class Pace {
  public:
    explicit Pace(const ReadJob& job) : m_job(job) {}
    // Every few thousand calls.
    bool IsDue() { return ++m_num_calls % kEvery == 0; }
    // Calls the watch, which may throw, and whoever asked for the progress.
    void Report(uint64_t numBytesDone) const;

  private:
    static constexpr uint32_t kEvery = 4096;

    const ReadJob& m_job;
    uint32_t m_num_calls = 0;
};

} // namespace booleq

#endif
