// The pool of names: each distinct name is kept once, at one place, until the pool is destroyed.
#ifndef KQ_NAMEPOOL_H
#define KQ_NAMEPOOL_H

#include <atomic>
#include <memory>
#include <mutex>

#include "Name.h"

// A hash table in shards, each with a table of its own.
// Threads: all at any time. A name that is there is found without a lock. A new one, and a larger
// table, is made before its shard's lock is taken; a thread that loses the race throws its own away
// afterwards. So whoever serves or takes back memory may use the pool.
// Invariants:
// 1. An entry that a table shows is complete and never changes, moves or goes.
// 2. A shard's table shows every name of the shard; it is at most half full. Tables it has outgrown
//    are kept, because a reader may still look at one: they are smaller than the present one
//    together.
class KqNamePool {
  public:
    KqNamePool() = default;
    ~KqNamePool();
    KqNamePool(const KqNamePool&) = delete;
    KqNamePool& operator=(const KqNamePool&) = delete;

    // The one entry equal to the 'length' bytes at 'name', made on first request. No byte is NUL.
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

        // The slot that holds the name, or the first free one on its way.
        Slot* SlotOf(const char* name, size_t length, uint64_t hash) const
        {
            size_t position = static_cast<size_t>(hash) & mask;
            for (;; position = (position + 1) & mask) {
                const KqName* const entry = slots[position].load(std::memory_order_acquire);
                if (!entry || KqIsNamed(entry->text, entry->hash, name, length, hash))
                    return &slots[position];
            }
        }

        const size_t mask; // the number of slots, a power of two, less 1
        const std::unique_ptr<Slot[]> slots;
        std::unique_ptr<Table> outgrown; // the one before
    };

    // What every look-up reads and what every new name writes lie in cache lines of their own: on
    // one line, names that two threads add slow each other's look-ups down by a third.
    struct Shard {
        alignas(kCacheLine) std::atomic<Table*> table{nullptr}; // owned
        alignas(kCacheLine) std::mutex lock;                    // held by whoever adds a name
        size_t numNames = 0;
    };

    const KqName& Add(Shard& shard, const char* name, size_t length, uint64_t hash);
    static size_t CountSlotsToMake(const Shard& shard);
    static void TakeTable(Shard& shard, std::unique_ptr<Table> larger) noexcept;

    Shard m_shards[kNumShards];
};

#endif
