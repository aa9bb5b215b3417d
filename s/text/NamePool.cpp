// A name in, its one entry out, for all threads at once.
// Fails: std::bad_alloc, and the pool is as it was.  Cost: in step with the name's length.
#include "NamePool.h"

#include <cassert>
#include <string>

namespace {

constexpr size_t kFirstSlots = 16;

// Its address differs from process to process where the system wants that.
const char kAnchor = 0;

uint64_t LoadBytes(const char* bytes, size_t length)
{
    uint64_t word = 0;
    std::memcpy(&word, bytes, length);
    return word;
}

// The bytes of a text of up to eight, each of them at least once.
uint64_t LoadShort(const char* text, size_t length)
{
    if (length >= 4)
        return LoadBytes(text, 4) << 32 | LoadBytes(text + length - 4, 4);
    if (length == 0)
        return 0;
    return uint64_t(static_cast<unsigned char>(text[0])) << 16 |
           uint64_t(static_cast<unsigned char>(text[length / 2])) << 8 |
           static_cast<unsigned char>(text[length - 1]);
}

// One to one: an odd factor and a shifted exclusive or can both be undone.
uint64_t Mix(uint64_t word)
{
    word *= 0x9e3779b97f4a7c15u;
    word ^= word >> 32;
    word *= 0xd6e8feb86659fd93u;
    return word ^ word >> 29;
}

} // namespace

uint64_t KqHashText(const char* text, size_t length)
{
    const uint64_t seed = reinterpret_cast<uintptr_t>(&kAnchor) + length * 0xa0761d6478bd642fu;
    if (length <= kKqMaxExactHash)
        return Mix(LoadShort(text, length) ^ seed);
    uint64_t hash = seed;
    const char* const lastEight = text + length - 8;
    for (; text < lastEight; text += 8)
        hash = Mix(hash ^ LoadBytes(text, 8));
    return Mix(hash ^ LoadBytes(lastEight, 8));
}

KqNamePool::~KqNamePool()
{
    for (Shard& shard : m_shards) {
        std::unique_ptr<Table> table(shard.table.load(std::memory_order_relaxed));
        for (size_t position = 0; table && position <= table->mask; ++position)
            delete table->slots[position].load(std::memory_order_relaxed);
        // One after another: a chain of destructors would be as deep as it is long.
        while (table)
            table = std::move(table->outgrown);
    }
}

const KqName& KqNamePool::Add(Shard& shard, const char* name, size_t length, uint64_t hash)
{
    // The host's string is made of a text with a NUL byte at its end.
    const std::string text(name, length);
    assert(text.find('\0') == std::string::npos);
    std::unique_ptr<const KqName> entry(new KqName{text.c_str(), hash}); // outlives the lock
    const std::lock_guard<std::mutex> adding(shard.lock);
    Table& table = MakeRoom(shard);
    Slot* const slot = table.SlotOf(name, length, hash);
    const KqName* const other = slot->load(std::memory_order_relaxed);
    if (other)
        return *other;
    const KqName& added = *entry;
    slot->store(entry.release(), std::memory_order_release);
    ++shard.numNames;
    return added;
}

// The shard's table, with a free slot for one more name.
// Requires: the shard's lock.
KqNamePool::Table& KqNamePool::MakeRoom(Shard& shard)
{
    Table* const table = shard.table.load(std::memory_order_relaxed);
    const size_t numSlots = table ? table->mask + 1 : 0;
    if (2 * (shard.numNames + 1) <= numSlots)
        return *table;
    std::unique_ptr<Table> larger(new Table(numSlots == 0 ? kFirstSlots : 4 * numSlots));
    for (size_t position = 0; position < numSlots; ++position) {
        const KqName* const entry = table->slots[position].load(std::memory_order_relaxed);
        if (entry)
            larger->SlotOf(entry->text.c_str(), entry->text.length(), entry->hash)
                ->store(entry, std::memory_order_relaxed);
    }
    larger->outgrown.reset(table);
    shard.table.store(larger.get(), std::memory_order_release);
    return *larger.release();
}
