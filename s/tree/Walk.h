// The one walk over trees. It does not recurse: the text decides how deep a tree is, and the stack
// belongs to the host. The first entries of the walk's own stack are stored in place, so ordinary
// walks allocate nothing.
#ifndef KQ_WALK_H
#define KQ_WALK_H

#include <cassert>
#include <cstddef>
#include <type_traits>
#include <vector>

// A last-in first-out stack of plain values; the first kInline of them need no heap.
// Requires: Pop and Top on a stack that is not empty.  Fails: std::bad_alloc from Add.
template <class Entry, size_t kInline>
class KqStack {
    static_assert(std::is_trivially_copyable<Entry>::value, "entries are plain values");

  public:
    bool IsEmpty() const { return m_size == 0; }

    // Adds an entry on top, to be filled in place: copying a finished one there would have to wait
    // for the parts it was just made of.
    Entry& Add()
    {
        if (m_size >= kInline)
            m_rest.emplace_back();
        ++m_size;
        return Top();
    }

    void Pop()
    {
        assert(m_size > 0);
        if (m_size > kInline)
            m_rest.pop_back();
        --m_size;
    }

    Entry& Top()
    {
        assert(m_size > 0);
        return m_size <= kInline ? m_first[m_size - 1] : m_rest.back();
    }

  private:
    size_t m_size = 0;
    Entry m_first[kInline];
    std::vector<Entry> m_rest;
};

// What a visitor wants at the place it has entered: which of the places below to visit, and whether
// to come back to it between them and after the last.
enum KqBelow : unsigned int {
    KQ_NONE = 0,
    KQ_ONE = 1,  // the first alone
    KQ_BOTH = 2, // the first, then the second
    KQ_RETURN = 4,
    KQ_END = 8 // ends the whole walk
};

// For visitors that never return to a place.
struct KqPreOrder {
    template <class Place>
    bool Between(Place&, Place&)
    {
        return true;
    }
    template <class Place>
    void Leave(Place&)
    {
    }
};

// What remains to be done with a waiting place.
enum KqStage : unsigned int { KQ_TO_ENTER, KQ_AFTER_FIRST, KQ_AFTER_LAST };

template <class Place, bool kIsPreOrder>
struct KqWaiting {
    KqStage GetStage() const { return stage; }
    void Set(const Place& newPlace, KqStage newStage)
    {
        place = newPlace;
        stage = newStage;
    }

    Place place;
    KqStage stage;
};

// A visitor that never returns only leaves places to enter; without a stage, pointers take half the
// memory.
template <class Place>
struct KqWaiting<Place, true> {
    static KqStage GetStage() { return KQ_TO_ENTER; }
    void Set(const Place& newPlace, KqStage newStage)
    {
        assert(newStage == KQ_TO_ENTER);
        (void)newStage;
        place = newPlace;
    }

    Place place;
};

// Walks a tree from 'place' down, in pre-order and, where the visitor asks for it, in post-order.
// A place is a plain value with whatever the visitor needs to know about a node: a pointer, a pair,
// or a pointer with a depth or a result. The visitor has
//     unsigned int Enter(Place& place, Place& first, Place& second)
//         the place is reached; sets the places below, but not the second when it will return;
//         returns a KqBelow, or'ed with KQ_RETURN;
//     bool Between(Place& place, Place& second)
//         all below the first is done; sets the second, or returns false to skip it;
//     void Leave(Place& place)
//         all below is done.
// Fails: std::bad_alloc.  Cost: O(places); memory for the places that wait at one time.
template <class Place, class Visitor>
void KqWalk(Place place, Visitor&& visitor)
{
    typedef KqWaiting<Place, std::is_base_of_v<KqPreOrder, std::decay_t<Visitor>>> Waiting;
    KqStack<Waiting, 64> waiting;
    for (;;) {
        Place first = place;
        Place second = place;
        const unsigned int below = visitor.Enter(place, first, second);
        if ((below & KQ_END) != 0)
            return;
        if ((below & KQ_RETURN) != 0)
            waiting.Add().Set(place, (below & KQ_BOTH) != 0 ? KQ_AFTER_FIRST : KQ_AFTER_LAST);
        else if ((below & KQ_BOTH) != 0)
            waiting.Add().Set(second, KQ_TO_ENTER);
        if ((below & (KQ_ONE | KQ_BOTH)) != 0) {
            place = first;
            continue;
        }
        for (;;) {
            if (waiting.IsEmpty())
                return;
            Waiting& top = waiting.Top();
            if (top.GetStage() == KQ_AFTER_LAST) {
                visitor.Leave(top.place);
                waiting.Pop();
                continue;
            }
            place = top.place;
            if (top.GetStage() == KQ_TO_ENTER) {
                waiting.Pop();
                break;
            }
            top.Set(place, KQ_AFTER_LAST);
            if (visitor.Between(top.place, place))
                break;
            visitor.Leave(top.place);
            waiting.Pop();
        }
    }
}

#endif
