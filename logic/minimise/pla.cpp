// From the rows of a PLA file to sets, and back to a file.
#include "pla.h"

#include <algorithm>
#include <numeric>

#include "cube_columns.h"
#include "unate.h"

namespace booleq {

namespace {

constexpr size_t kMaxPairsToTry = 4096;
// The number of cubes that a complement may have for each output.
constexpr size_t kManyCubes = size_t(1) << 17;
constexpr size_t kMaxCubes = size_t(1) << 20;

// Finds a cube of one list and one of another that have a row of an output in common.
class MeetingSearch {
  public:
    MeetingSearch(const CubeSpace& space, const CubeList& left, const CubeList& right, Work& work)
        : m_space(space), m_left(left), m_right(right), m_work(work), m_is_split(space.NumInputs())
    {
    }

    bool Find(size_t& leftIndex, size_t& rightIndex)
    {
        std::vector<uint32_t> left(m_left.Size());
        std::vector<uint32_t> right(m_right.Size());
        std::iota(left.begin(), left.end(), 0u);
        std::iota(right.begin(), right.end(), 0u);
        const bool isFound = FindIn(left, right);
        leftIndex = m_left_index;
        rightIndex = m_right_index;
        return isFound;
    }

  private:
    // Depth: one level for each input.
    bool FindIn(const std::vector<uint32_t>& left, const std::vector<uint32_t>& right)
    {
        if (left.empty() || right.empty())
            return false;
        size_t input = 0;
        if (uint64_t(left.size()) * right.size() <= kMaxPairsToTry ||
            !ChooseInput(left, right, input))
            return TryPairs(left, right);
        m_is_split[input] = true;
        for (const size_t value : {0u, 1u})
            if (FindIn(Admitting(m_left, left, 2 * input + value),
                       Admitting(m_right, right, 2 * input + value)))
                return true;
        m_is_split[input] = false;
        return false;
    }

    bool TryPairs(const std::vector<uint32_t>& left, const std::vector<uint32_t>& right)
    {
        for (const uint32_t leftIndex : left) {
            m_work.Spend(right.size());
            for (const uint32_t rightIndex : right) {
                if (IsDisjoint(m_space, m_left.At(leftIndex), m_right.At(rightIndex)))
                    continue;
                m_left_index = leftIndex;
                m_right_index = rightIndex;
                return true;
            }
        }
        return false;
    }

    // The input that most cubes of both lists fix. False if none fixes any.
    bool ChooseInput(const std::vector<uint32_t>& left, const std::vector<uint32_t>& right,
                     size_t& input)
    {
        std::vector<uint64_t> counts(m_space.NumInputs());
        CountFixed(m_left, left, counts);
        CountFixed(m_right, right, counts);
        uint64_t best = 0;
        for (size_t index = 0; index < counts.size(); ++index) {
            if (!m_is_split[index] && counts[index] > best) {
                best = counts[index];
                input = index;
            }
        }
        return best > 0;
    }

    void CountFixed(const CubeList& cubes, const std::vector<uint32_t>& indices,
                    std::vector<uint64_t>& counts)
    {
        m_work.Spend(indices.size() * m_space.NumWords());
        for (const uint32_t index : indices)
            for (size_t word = 0; word < m_space.NumInputWords(); ++word)
                for (uint64_t rest = ~cubes.At(index)[word] & m_space.Inputs(word); rest != 0;
                     rest &= rest - 1)
                    ++counts[(64 * word + LowestBit(rest)) / 2];
    }

    static std::vector<uint32_t> Admitting(const CubeList& cubes,
                                           const std::vector<uint32_t>& indices, size_t bit)
    {
        std::vector<uint32_t> admitting;
        for (const uint32_t index : indices)
            if (GetBit(cubes.At(index), bit))
                admitting.push_back(index);
        return admitting;
    }

    const CubeSpace& m_space;
    const CubeList& m_left;
    const CubeList& m_right;
    Work& m_work;
    std::vector<bool> m_is_split;
    size_t m_left_index = 0;
    size_t m_right_index = 0;
};

void AppendNames(const char* directive, const std::vector<std::string>& names, std::string& text)
{
    text += directive;
    for (const std::string& name : names)
        text += " " + name;
    text += "\n";
}

} // namespace

bool FindMeeting(const CubeSpace& space, const CubeList& left, const CubeList& right, Work& work,
                 size_t& leftIndex, size_t& rightIndex)
{
    return MeetingSearch(space, left, right, work).Find(leftIndex, rightIndex);
}

namespace {

// Adds to problem.free the rows that the file calls free, except those that are off.
// Fails: false if that takes too many cubes.
bool AppendFree(const Pla& pla, TwoLevelProblem& problem, Work& work)
{
    const CubeList none(pla.space.NumWords());
    CubeList notOff(pla.space.NumWords());
    if (!FindComplement(pla.space, pla.off, none, kMaxCubes, work, notOff))
        return false;
    std::vector<uint64_t> common(pla.space.NumWords());
    for (size_t index = 0; index < pla.free.Size(); ++index) {
        work.Spend(notOff.Size());
        for (size_t other = 0; other < notOff.Size(); ++other) {
            if (IsDisjoint(pla.space, pla.free.At(index), notOff.At(other)))
                continue;
            for (size_t word = 0; word < common.size(); ++word)
                common[word] = pla.free.At(index)[word] & notOff.At(other)[word];
            problem.free.Append(common.data());
        }
        if (problem.free.Size() > kMaxCubes)
            return false;
    }
    RemoveContained(problem.space, problem.free, work);
    return true;
}

} // namespace

void SetOff(TwoLevelProblem& problem, Work& work)
{
    // Growing a cube either goes through all off cubes, or asks the other lists once for each
    // input.
    const size_t numGiven = problem.on.Size() + problem.free.Size();
    const size_t maxCubes =
        std::min(kMaxCubes, std::max(kManyCubes, numGiven * problem.space.NumInputs()));
    problem.hasOff =
        FindComplement(problem.space, problem.on, problem.free, maxCubes, work, problem.off);
}

bool IsConsistent(const Pla& pla, PlaFault& fault, Work& work)
{
    if (pla.type == PlaType::F || pla.type == PlaType::Fd)
        return true;
    size_t onIndex = 0;
    size_t offIndex = 0;
    if (!FindMeeting(pla.space, pla.on, pla.off, work, onIndex, offIndex))
        return true;
    assert(!IsDisjoint(pla.space, pla.on.At(onIndex), pla.off.At(offIndex)));
    const size_t first = std::min(pla.onLines[onIndex], pla.offLines[offIndex]);
    const size_t second = std::max(pla.onLines[onIndex], pla.offLines[offIndex]);
    size_t output = 0;
    while (!GetBit(pla.on.At(onIndex), pla.space.OutputBit(output)) ||
           !GetBit(pla.off.At(offIndex), pla.space.OutputBit(output)))
        ++output;
    fault = {second,
             "lines " + std::to_string(first) + " and " + std::to_string(second) +
                 " contradict each other: output " + pla.outputs[output] +
                 " is both 1 and 0 in a row",
             ""};
    return false;
}

bool ToProblem(const Pla& pla, TwoLevelProblem& problem, PlaFault& fault, Work& work)
{
    problem.on = pla.on;
    problem.free = pla.free;
    if (pla.type == PlaType::F || pla.type == PlaType::Fd) {
        SetOff(problem, work);
        return true;
    }
    problem.off = pla.off;
    // Free is what is neither on nor off, and what is called free unless it is off.
    if (FindComplement(pla.space, pla.on, pla.off, kMaxCubes, work, problem.free) &&
        (pla.free.IsEmpty() || AppendFree(pla, problem, work)))
        return true;
    fault = {0, "the rows that the table leaves out need too many cubes",
             "write them with '-' and leave the rows that are 0 out (.type fd)"};
    return false;
}

std::string CubeText(const CubeSpace& space, const uint64_t* cube)
{
    std::string text;
    for (size_t input = 0; input < space.NumInputs(); ++input) {
        const bool hasZero = GetBit(cube, 2 * input);
        const bool hasOne = GetBit(cube, 2 * input + 1);
        assert(hasZero || hasOne);
        text += hasZero && hasOne ? '-' : hasOne ? '1' : '0';
    }
    text += ' ';
    for (size_t output = 0; output < space.NumOutputs(); ++output)
        text += GetBit(cube, space.OutputBit(output)) ? '1' : '0';
    return text;
}

std::string WritePla(const Pla& pla, const CubeList& sum)
{
    const CubeSpace& space = pla.space;
    std::string text = ".i " + std::to_string(space.NumInputs()) + "\n.o " +
                       std::to_string(space.NumOutputs()) + "\n";
    if (pla.hasInputNames)
        AppendNames(".ilb", pla.inputs, text);
    if (pla.hasOutputNames)
        AppendNames(".ob", pla.outputs, text);
    text += ".type f\n.p " + std::to_string(sum.Size()) + "\n";
    for (size_t index = 0; index < sum.Size(); ++index) {
        text += CubeText(space, sum.At(index)) + "\n";
    }
    return text + ".e\n";
}

} // namespace booleq
