// The pool of names: each distinct name is kept once, at one place, until the pool is destroyed.
#ifndef KQ_NAMEPOOL_H
#define KQ_NAMEPOOL_H

#include <atomic>
#include <memory>
#include <mutex>

#include "Name.h"

// A hash table split into shards, each with its own table.
// Threads: all at any time. A known name is found without a lock. A new name, or a larger table, is
// allocated before its shard's lock is taken; a thread that loses the race frees its own
// afterwards. So code that allocates or frees memory may itself use the pool.
// Invariants:
// 1. An entry that a table shows is complete and never changes, moves or goes away.
// 2. A shard's table shows every name of the shard and is at most half full. Tables that it has
//    outgrown are kept, because a reader may still be using one; together they are smaller than the
//    current one.
class KqNamePool {
  public:
    KqNamePool() = default;
    ~KqNamePool();
    KqNamePool(const KqNamePool&) = delete;
    KqNamePool& operator=(const KqNamePool&) = delete;

    // The one entry equal to the 'length' bytes at 'name', made on first request. No byte may be
    // NUL.
    // Fails: std::bad_alloc; the pool stays usable.  Cost: in step with the name's length.
    const KqName& Find(const char* name, size_t length)
    {
        const uint64_t hash = KqHashText(name, length);
        Shard& shard = m_shards[hash >> kShardShift];
        const Table* const table = shard.table.load(std::memory_order_acquire);
        if (table) {
            const KqName* const found =
                table->SlotOf(name, length, hash)->load(std::memory_order_acquire);
            if (found)
                return *found;
        }
        return Add(shard, name, length, hash);
    }

  private:
    static constexpr unsigned int kShardShift = 58;
    static constexpr size_t kNumShards = size_t(1) << (64 - kShardShift);
    static constexpr size_t kCacheLine = 64; // bytes

    typedef std::atomic<const KqName*> Slot;

    struct Table {
        explicit Table(size_t numSlots) : mask(numSlots - 1), slots(new Slot[numSlots]()) {}

        // The slot that holds the name, or the first free one in its search order.
        Slot* SlotOf(const char* name, size_t length, uint64_t hash) const
        {
            size_t position = static_cast<size_t>(hash) & mask;
            for (;; position = (position + 1) & mask) {
                const KqName* const entry = slots[position].load(std::memory_order_acquire);
                if (!entry || KqIsNamed(entry->text, entry->hash, name, length, hash))
                    return &slots[position];
            }
        }

        const size_t mask; // the number of slots, a power of two, minus 1
        const std::unique_ptr<Slot[]> slots;
        std::unique_ptr<Table> outgrown; // the table before this one
    };

    // What every look-up reads and what every new name writes lie on separate cache lines: on one
    // line, two threads that add names would slow each other's look-ups down by a third.
    struct Shard {
        alignas(kCacheLine) std::atomic<Table*> table{nullptr}; // owned
        alignas(kCacheLine) std::mutex lock;                    // held while a name is added
        size_t numNames = 0;
    };

    const KqName& Add(Shard& shard, const char* name, size_t length, uint64_t hash);
    static size_t CountSlotsToMake(const Shard& shard);
    static void TakeTable(Shard& shard, std::unique_ptr<Table> larger) noexcept;

    Shard m_shards[kNumShards];
};

#endif
