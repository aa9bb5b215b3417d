// A name in, its one entry out, for all threads at once.
// Fails: std::bad_alloc, and the pool is as it was.  Cost: in step with the name's length.
#include "NamePool.h"

#include <cassert>
#include <string>
#include <utility>

namespace {

constexpr size_t kFirstSlots = 16;

// Its address differs from process to process where the system randomises addresses.
const char kAnchor = 0;

// The bytes of one Word, in the machine's order.
template <class Word>
uint64_t Load(const char* bytes)
{
    Word word = 0;
    std::memcpy(&word, bytes, sizeof word);
    return word;
}

// Loads all bytes of a text of up to eight bytes, each at least once.
uint64_t LoadShort(const char* text, size_t length)
{
    if (length >= 4)
        return Load<uint32_t>(text) << 32 | Load<uint32_t>(text + length - 4);
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
        hash = Mix(hash ^ Load<uint64_t>(text));
    return Mix(hash ^ Load<uint64_t>(lastEight));
}

KqNamePool::~KqNamePool()
{
    for (Shard& shard : m_shards) {
        std::unique_ptr<Table> table(shard.table.load(std::memory_order_relaxed));
        for (size_t position = 0; table && position <= table->mask; ++position)
            delete table->slots[position].load(std::memory_order_relaxed);
        // One after another: nested destructors would go as deep as the chain is long.
        while (table)
            table = std::move(table->outgrown);
    }
}

const KqName& KqNamePool::Add(Shard& shard, const char* name, size_t length, uint64_t hash)
{
    // The host's string is made from a text that ends with a NUL byte.
    const std::string text(name, length);
    assert(text.find('\0') == std::string::npos);
    // Declared before the lock, so that both are freed after it is released.
    std::unique_ptr<const KqName> entry(new KqName{text.c_str(), hash});
    std::unique_ptr<Table> larger;
    std::unique_lock<std::mutex> adding(shard.lock);
    while (const size_t numSlots = CountSlotsToMake(shard)) {
        if (larger && larger->mask + 1 == numSlots) {
            TakeTable(shard, std::move(larger));
            break;
        }
        // Meanwhile other threads may add names, and tables for them.
        adding.unlock();
        larger.reset(new Table(numSlots));
        adding.lock();
    }
    const Table& table = *shard.table.load(std::memory_order_relaxed);
    Slot* const slot = table.SlotOf(name, length, hash);
    const KqName* const other = slot->load(std::memory_order_relaxed);
    assert(!other || other->hash == hash);
    if (other)
        return *other;
    const KqName* const added = entry.release();
    slot->store(added, std::memory_order_release);
    ++shard.numNames;
    assert(2 * shard.numNames <= table.mask + 1);
    return *added;
}

// The size of the table that the shard needs for one more name; 0 when the current one has room.
// Requires: the shard's lock.
size_t KqNamePool::CountSlotsToMake(const Shard& shard)
{
    const Table* const table = shard.table.load(std::memory_order_relaxed);
    if (!table)
        return kFirstSlots;
    const size_t numSlots = table->mask + 1;
    return 2 * (shard.numNames + 1) <= numSlots ? 0 : 4 * numSlots;
}

// Publishes a larger table that shows all names.
// Requires: the shard's lock.
void KqNamePool::TakeTable(Shard& shard, std::unique_ptr<Table> larger) noexcept
{
    Table* const table = shard.table.load(std::memory_order_relaxed);
    for (size_t position = 0; table && position <= table->mask; ++position) {
        const KqName* const entry = table->slots[position].load(std::memory_order_relaxed);
        if (entry)
            larger->SlotOf(entry->text.c_str(), entry->text.length(), entry->hash)
                ->store(entry, std::memory_order_relaxed);
    }
    assert(!table || larger->mask > table->mask);
    larger->outgrown.reset(table);
    shard.table.store(larger.release(), std::memory_order_release);
}
