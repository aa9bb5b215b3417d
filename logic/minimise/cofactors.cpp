// Cofactors of the cubes that meet a cube, and whether they cover it.
#include "cofactors.h"

#include "unate.h"

namespace booleq {

void AppendCofactor(const CubeSpace& space, const uint64_t* cube, const uint64_t* by,
                    CubeList& target)
{
    assert(!IsDisjoint(space, cube, by));
    target.Resize(target.Size() + 1);
    uint64_t* cofactor = target.At(target.Size() - 1);
    for (size_t word = 0; word < space.NumWords(); ++word)
        cofactor[word] = ((cube[word] | ~by[word]) & space.Inputs(word)) |
                         (cube[word] & by[word] & space.Outputs(word));
}

void AppendOfOutput(const CubeSpace& space, const CubeList& cubes, size_t output, CubeList& target)
{
    assert(target.NumWords() == space.NumInputWords());
    const size_t bit = space.OutputBit(output);
    const size_t numWords = space.NumInputWords();
    size_t count = target.Size();
    target.Resize(count + cubes.Size());
    for (size_t index = 0; index < cubes.Size(); ++index) {
        const uint64_t* cube = cubes.At(index);
        if (!GetBit(cube, bit))
            continue;
        uint64_t* inputs = target.At(count++);
        for (size_t word = 0; word < numWords; ++word)
            inputs[word] = cube[word] | ~space.Inputs(word);
    }
    target.Resize(count);
}

Cofactors::Cofactors(const CubeSpace& space, CubeIndex& first, CubeIndex& second, Work& work)
    : m_space(space), m_first(first), m_second(second), m_work(work), m_meeting(space.NumWords()),
      m_of_output(space.NumInputWords())
{
}

void Cofactors::Take(const uint64_t* cube, size_t left)
{
    m_meeting.Resize(0);
    m_first.Find(cube, 0, m_work, m_found);
    for (const uint32_t index : m_found)
        if (index != left)
            AppendCofactor(m_space, m_first.Cubes().At(index), cube, m_meeting);
    m_second.Find(cube, 0, m_work, m_found);
    for (const uint32_t index : m_found)
        AppendCofactor(m_space, m_second.Cubes().At(index), cube, m_meeting);
    m_work.Spend(m_meeting.Size() * m_space.NumWords());
}

CubeList& Cofactors::OfOutput(size_t output)
{
    m_work.Spend(m_meeting.Size());
    assert(output < m_space.NumOutputs());
    m_of_output.Resize(0);
    AppendOfOutput(m_space, m_meeting, output, m_of_output);
    return m_of_output;
}

bool Cofactors::Cover(const uint64_t* cube, size_t left)
{
    Take(cube, left);
    for (size_t output = 0; output < m_space.NumOutputs(); ++output)
        if (GetBit(cube, m_space.OutputBit(output)) &&
            !IsTautology(m_space, OfOutput(output), m_work))
            return false;
    return true;
}

bool IsCovered(const CubeSpace& space, const uint64_t* cube, const CubeList& first,
               const CubeList& second, Work& work)
{
    CubeIndex firstIndex(space, first);
    CubeIndex secondIndex(space, second);
    return Cofactors(space, firstIndex, secondIndex, work).Cover(cube, SIZE_MAX);
}

} // namespace booleq
