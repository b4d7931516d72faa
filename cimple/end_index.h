// Which members of a store of associations refer to an instance, by the keys of what they refer to.
//
// Built at the first question after a change of the store, thrown away by the next change. Guarded
// by the store's own lock.
#ifndef CIMPLE_END_INDEX_H
#define CIMPLE_END_INDEX_H

#include "cimple/key_shapes.h"

#include <vector>

namespace cimple {

class End_Index {
public:
    // Throws std::bad_alloc; then the index is to be built again.
    void build(const Array<Instance*>& members);

    // Ascending positions of members, among them each one that is_reference_to(member, end, "")
    // holds for. False, and no positions, when only a walk of all members can tell: a member has a
    // scalar reference that is no key, which may change at any time; or ends occur that have more
    // keys than this one, under which their hashes say nothing.
    bool find(const Instance* end, const Array<Instance*>& members,
              std::vector<uint32>& positions) const;

private:
    struct Row {
        uint64 hash;
        uint32 position;

        bool operator==(const Row&) const = default;
    };
    struct Sample {
        uint32 position;
        const Meta_Reference* reference;
    };

    void add_member(uint32 position, const Instance* member);

    bool _complete = false; // every scalar reference of every member is in the rows
    std::vector<Row> _rows; // sorted by hash, then by position
    detail::Key_Shapes<Sample> _shapes;
};

} // namespace cimple

#endif // CIMPLE_END_INDEX_H
