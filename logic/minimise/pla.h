// PLA files: tables of cubes for several outputs, read and written. The reader takes text and gives
// rows with their lines; Problem turns them into sets. Errors name the line, what is wrong there,
// and what to write instead.
#ifndef BOOLEQ_MINIMISE_PLA_H
#define BOOLEQ_MINIMISE_PLA_H

#include <string>
#include <vector>

#include "cube.h"
#include "two_level.h"

namespace booleq {

constexpr size_t kMaxPlaInputs = 4096;
constexpr size_t kMaxPlaOutputs = 4096;

// What the digits of outputs say: f: on; fd: on and free; fr: on and off; fdr: all three. Rows that
// nothing is said of are off for the first two, free for the others.
enum class PlaType { F, Fd, Fr, Fdr };

// Invariant: the lists are over 'space'; each cube's line is beside it.
struct Pla {
    Pla() : space(0, 0), on(1), free(1), off(1) {}
    CubeSpace space;
    std::vector<std::string> inputs; // names: as given, or made up
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
// Cost: in step with the text; memory about the cubes of the rows, twice while it reads.
bool ReadPla(const std::string& text, Pla& pla, PlaFault& fault);

// Fails: false when a row is both on and off for an output, with the two lines in the fault.
bool IsConsistent(const Pla& pla, PlaFault& fault, Work& work);

// Sets of rows for the search. Fails: false when these would be too many cubes.
// Requires: IsConsistent(pla).
bool ToProblem(const Pla& pla, TwoLevelProblem& problem, PlaFault& fault, Work& work);

// Sets 'off' from the other lists, or says that it has too many cubes to be of use.
void SetOff(TwoLevelProblem& problem, Work& work);

// Whether a cube of one list and one of the other have a row of an output in common; their places.
// Cost: far below one step for each pair, unless nearly all pairs meet.
bool FindMeeting(const CubeSpace& space, const CubeList& left, const CubeList& right, Work& work,
                 size_t& leftIndex, size_t& rightIndex);

// "1-0 10": a digit for each input, a blank, a digit for each output.
std::string CubeText(const CubeSpace& space, const uint64_t* cube);

// A sum of products as a file of type f with the names of 'pla' where it had any.
std::string WritePla(const Pla& pla, const CubeList& sum);

} // namespace booleq

#endif
