// Lowers and raises parts against blocks of off cubes.
#include "obstacles.h"

#include <algorithm>
#include <numeric>

namespace booleq {

namespace {

// An input has two parts, a pair of bits: this is the other one of the pair.
constexpr uint32_t Other(uint32_t part)
{
    return part ^ 1u;
}

// The parts of a word that are alone in their pair.
uint64_t Literals(const CubeSpace& space, const uint64_t* cube, size_t word)
{
    const uint64_t both = cube[word] & cube[word] >> 1 & space.InputLow(word);
    return cube[word] & space.Inputs(word) & ~(both * 3);
}

} // namespace

Obstacles::Obstacles(const CubeSpace& space, const CubeList& off, Work& work)
    : m_space(space), m_work(work), m_off(space, off), m_active(m_off.NumBlocks()),
      m_common(m_off.NumBlocks()), m_order(m_off.NumBlocks()), m_seen(space.NumWords())
{
    std::iota(m_order.begin(), m_order.end(), 0u);
}

bool Obstacles::IsMet(const uint64_t* cube)
{
    if (!ListColumns(m_space, cube, m_to_meet))
        return false;
    const size_t numAsked = m_to_meet.inputs.size() + m_to_meet.outputs.size();
    for (size_t place = 0; place < m_order.size(); ++place) {
        if (MeetingInBlock(m_off, m_order[place], m_to_meet) == 0)
            continue;
        std::swap(m_order[place], m_order[place / 2]); // blocks that object move to the front
        m_work.Spend((place + 1) * numAsked / 2);
        return true;
    }
    m_work.Spend(m_order.size() * numAsked / 2);
    return false;
}

void Obstacles::Start(const uint64_t* raised, const uint64_t* free)
{
    Parts& closed = m_inputs;
    Parts& given = m_given;
    Parts& open = m_outputs;
    for (Parts* parts : {&closed, &given, &open})
        parts->clear();
    for (size_t word = 0; word < m_space.NumWords(); ++word) {
        const uint64_t literals = Literals(m_space, raised, word);
        const uint64_t low = m_space.InputLow(word);
        const uint64_t isOpen = (free[word] | free[word] >> 1) & low;
        assert((raised[word] & free[word]) == 0);
        AppendBits(literals & ~(isOpen * 3), word, closed);
        AppendBits(raised[word] & m_space.Outputs(word), word, given);
        AppendBits(free[word] & m_space.Outputs(word), word, open);
        m_seen[word] = raised[word];
    }
    m_live.clear();
    m_work.Spend(m_off.NumBlocks() * (closed.size() + given.size() + open.size()) / 2);
    for (size_t block = 0; block < m_off.NumBlocks(); ++block) {
        const uint64_t* columns = m_off.Block(block);
        uint64_t active = m_off.Cubes(block);
        for (size_t index = 0; index < closed.size() && active != 0; ++index)
            active &= columns[closed[index]];
        if (active == 0)
            continue;
        m_common[block] = AnyColumn(columns, given);
        m_active[block] = active & (m_common[block] | AnyColumn(columns, open));
        if (m_active[block] != 0)
            m_live.push_back(static_cast<uint32_t>(block));
    }
}

// Free parts that 'with' lacks are open; free outputs that 'with' has are given.
void Obstacles::ListOpen(const uint64_t* free, const uint64_t* with)
{
    m_inputs.clear();
    m_outputs.clear();
    m_given.clear();
    for (size_t word = 0; word < m_space.NumWords(); ++word) {
        const uint64_t open = free[word] & ~(with ? with[word] : 0);
        AppendBits(open & m_space.Inputs(word), word, m_inputs);
        AppendBits(open & m_space.Outputs(word), word, m_outputs);
        AppendBits(free[word] & ~open & m_space.Outputs(word), word, m_given);
    }
}

void Obstacles::Settle(uint64_t* raised, uint64_t* free)
{
    Parts& added = m_given;
    added.clear();
    for (size_t word = m_space.FirstOutputWord(); word < m_space.NumWords(); ++word) {
        AppendBits(raised[word] & ~m_seen[word] & m_space.Outputs(word), word, added);
        m_seen[word] |= raised[word];
    }
    if (!added.empty())
        for (const uint32_t block : m_live)
            m_common[block] |= AnyColumn(m_off.Block(block), added);
    ListOpen(free, nullptr);
    m_lowered_inputs.clear();
    m_num_lowered_outputs = 0;
    while (LowerAndDrop(free)) {
    }
    RaiseUnblocked(raised, free);
}

// The cubes of a block that are one step away from what is raised.
// Requires: each is at least one step away.
uint64_t Obstacles::FindNear(const uint64_t* columns, uint64_t common) const
{
    uint64_t one = ~common;
    uint64_t two = 0;
    for (const uint32_t part : m_inputs) {
        const uint64_t away = ~columns[Other(part)];
        two |= one & away;
        one |= away;
    }
    return one & ~two;
}

// One pass over the blocks. True if parts were lowered, so that more cubes may be out of reach.
bool Obstacles::LowerAndDrop(uint64_t* free)
{
    m_work.Spend(m_live.size() * (m_inputs.size() + m_outputs.size() / 4 + 2) / 2);
    const size_t numBefore = m_lowered_inputs.size();
    const size_t numOutputsBefore = m_num_lowered_outputs;
    size_t numLive = 0;
    for (const uint32_t block : m_live) {
        const uint64_t* columns = m_off.Block(block);
        DropOutOfReach(block);
        if (m_active[block] == 0)
            continue;
        const uint64_t near = m_active[block] & FindNear(columns, m_common[block]);
        if (near != 0)
            LowerFor(near, block, free);
        m_active[block] &= ~near; // they cannot be met any more
        if (m_active[block] != 0)
            m_live[numLive++] = block;
    }
    assert(numLive <= m_live.size());
    m_live.resize(numLive);
    const bool isLowered =
        m_lowered_inputs.size() > numBefore || m_num_lowered_outputs > numOutputsBefore;
    m_lowered_inputs.erase(m_lowered_inputs.begin(),
                           m_lowered_inputs.begin() + static_cast<std::ptrdiff_t>(numBefore));
    m_num_lowered_outputs -= numOutputsBefore;
    return isLowered;
}

// Drops the cubes of a block that only recently lowered parts could have met.
void Obstacles::DropOutOfReach(size_t block)
{
    const uint64_t* columns = m_off.Block(block);
    for (const uint32_t part : m_lowered_inputs)
        m_active[block] &= columns[Other(part)];
    if (m_num_lowered_outputs > 0)
        m_active[block] &= m_common[block] | AnyColumn(columns, m_outputs);
}

// Lowers the parts that separate what is raised from the cubes 'near'.
void Obstacles::LowerFor(uint64_t near, size_t block, uint64_t* free)
{
    const uint64_t* columns = m_off.Block(block);
    for (size_t place = m_inputs.size(); place-- > 0;) {
        const uint32_t part = m_inputs[place];
        if ((near & ~columns[Other(part)]) == 0)
            continue;
        ClearBit(free, part);
        m_lowered_inputs.push_back(part);
        m_inputs[place] = m_inputs.back();
        m_inputs.pop_back();
    }
    const uint64_t nearByOutputs = near & ~m_common[block];
    for (size_t place = nearByOutputs != 0 ? m_outputs.size() : 0; place-- > 0;) {
        const uint32_t part = m_outputs[place];
        if ((nearByOutputs & columns[part]) == 0)
            continue;
        ClearBit(free, part);
        ++m_num_lowered_outputs;
        m_outputs[place] = m_outputs.back();
        m_outputs.pop_back();
    }
}

// Raises the free parts that would bring no active cube nearer, and leaves them in the lists.
void Obstacles::RaiseUnblocked(uint64_t* raised, uint64_t* free)
{
    m_work.Spend(m_live.size());
    for (const uint32_t block : m_live) {
        const uint64_t* columns = m_off.Block(block);
        const auto dropBlocked = [&](Parts& parts, uint64_t cubes, uint32_t flip,
                                     uint64_t inverted) {
            for (size_t place = parts.size(); place-- > 0;) {
                if ((cubes & (columns[parts[place] ^ flip] ^ inverted)) == 0)
                    continue;
                parts[place] = parts.back();
                parts.pop_back();
            }
        };
        dropBlocked(m_inputs, m_active[block], 1, ~uint64_t(0));
        dropBlocked(m_outputs, m_active[block] & ~m_common[block], 0, 0);
    }
    for (const Parts* parts : {&m_inputs, &m_outputs}) {
        for (const uint32_t part : *parts) {
            assert(GetBit(free, part));
            SetBit(raised, part);
            ClearBit(free, part);
        }
    }
}

bool Obstacles::IsFeasible(const uint64_t* free, const uint64_t* with)
{
    ListOpen(free, with);
    const size_t numAsked = m_inputs.size() + m_given.size() + 1;
    for (size_t place = 0; place < m_live.size(); ++place) {
        const uint32_t block = m_live[place];
        const uint64_t* columns = m_off.Block(block);
        uint64_t met = m_active[block];
        for (size_t index = 0; index < m_inputs.size() && met != 0; ++index)
            met &= columns[Other(m_inputs[index])];
        if (met == 0 || (met & (m_common[block] | AnyColumn(columns, m_given))) == 0)
            continue;
        std::swap(m_live[place], m_live[place / 2]); // blocks that object move to the front
        m_work.Spend((place + 1) * numAsked / 4);
        return false;
    }
    m_work.Spend(m_live.size() * numAsked / 4);
    return true;
}

void Obstacles::ClearLowered(const uint64_t* free, const uint64_t* with, uint64_t* reach)
{
    ListOpen(free, with);
    m_work.Spend(m_live.size() * (m_inputs.size() + m_given.size() + 1) / 2);
    for (const uint32_t block : m_live) {
        const uint64_t* columns = m_off.Block(block);
        const uint64_t common = m_common[block] | AnyColumn(columns, m_given);
        const uint64_t near = m_active[block] & FindNear(columns, common);
        if (near == 0)
            continue;
        for (const uint32_t part : m_inputs)
            if ((near & ~columns[Other(part)]) != 0)
                ClearBit(reach, part);
        for (const uint32_t part : m_outputs)
            if ((near & ~common & columns[part]) != 0)
                ClearBit(reach, part);
    }
}

void Obstacles::CountFree(const uint64_t* free, std::vector<uint32_t>& counts)
{
    ListOpen(free, nullptr);
    counts.assign(64 * m_space.NumWords(), 0);
    m_work.Spend(m_live.size() * (m_inputs.size() + m_outputs.size()));
    for (const uint32_t block : m_live) {
        const uint64_t* columns = m_off.Block(block);
        for (const Parts* parts : {&m_inputs, &m_outputs})
            for (const uint32_t part : *parts)
                counts[part] += static_cast<uint32_t>(CountBits(m_active[block] & columns[part]));
    }
}

} // namespace booleq
