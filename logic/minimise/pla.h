// PLA files: tables of cubes for several outputs, read and written. The reader takes text and gives
// rows with their lines; ToProblem turns them into sets. A fault names the line, what is wrong
// there, and what to write instead.
#ifndef BOOLEQ_MINIMISE_PLA_H
#define BOOLEQ_MINIMISE_PLA_H

#include <string>
#include <vector>

#include "cube.h"
#include "two_level.h"

namespace booleq {

constexpr size_t kMaxPlaInputs = 4096;
constexpr size_t kMaxPlaOutputs = 4096;

// What the digits of outputs give: f: on; fd: on and free; fr: on and off; fdr: all three. Rows not
// mentioned are off for the first two and free for the others.
enum class PlaType { F, Fd, Fr, Fdr };

// Invariant: the lists are over 'space'; onLines and offLines hold the line of each of their cubes.
struct Pla {
    Pla() : space(0, 0), on(1), free(1), off(1) {}
    CubeSpace space;
    std::vector<std::string> inputs; // as given, or made up
    std::vector<std::string> outputs;
    bool hasInputNames = false;
    bool hasOutputNames = false;
    PlaType type = PlaType::Fd;
    CubeList on;
    CubeList free;
    CubeList off;
    std::vector<uint32_t> onLines;
    std::vector<uint32_t> offLines;
    size_t numRows = 0;
};

struct PlaFault {
    size_t line = 0; // 0: none
    std::string message;
    std::string hint; // may be empty
};

// Fails: false, with the fault; 'pla' is then unspecified.
// Cost: in step with the text; memory for the cubes of the rows, twice that while it reads.
bool ReadPla(const std::string& text, Pla& pla, PlaFault& fault);

// Fails: false if a row is both on and off for an output, with the two lines in the fault.
bool IsConsistent(const Pla& pla, PlaFault& fault, Work& work);

// Gives the sets of rows for the search. Fails: false if they would be too many cubes.
// Requires: IsConsistent(pla).
bool ToProblem(const Pla& pla, TwoLevelProblem& problem, PlaFault& fault, Work& work);

// Sets 'off' from the other lists, or clears hasOff if it has too many cubes to be of use.
void SetOff(TwoLevelProblem& problem, Work& work);

// Whether a cube of one list and a cube of the other have a row of an output in common; their
// places.
// Cost: far less than one step for each pair, unless nearly all pairs meet.
bool FindMeeting(const CubeSpace& space, const CubeList& left, const CubeList& right, Work& work,
                 size_t& leftIndex, size_t& rightIndex);

// "1-0 10": a digit for each input, a blank, a digit for each output.
std::string CubeText(const CubeSpace& space, const uint64_t* cube);

// A sum of products as a file of type f, with the names of 'pla' if it had any.
std::string WritePla(const Pla& pla, const CubeList& sum);

} // namespace booleq

#endif
