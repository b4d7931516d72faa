// The shapes of keys that occur in an index of hashed keys.
//
// Equal keys imply equal hashes only within one shape (see Key_Signature). An index practically
// always has one; it keeps count of them all, so that it knows when a look-up has to walk instead.
#ifndef CIMPLE_KEY_SHAPES_H
#define CIMPLE_KEY_SHAPES_H

#include "cimple/instance_detail.h"

#include <algorithm>
#include <bit>
#include <vector>

namespace cimple::detail {

// Sample tells where an instance of a shape is to be found; what that is, the index decides.
template <class Sample>
class Key_Shapes {
public:
    // Makes the next add succeed without allocating.
    void reserve_one() { _rows.reserve(std::bit_ceil(_rows.size() + 1)); }

    void add(uint64 shape, const Sample& sample) {
        if (Row* known = find(shape))
            ++known->count;
        else
            _rows.push_back({shape, 1, sample});
    }

    // Forgets an instance; the others of its shape, if any, get the sample that heir() answers.
    template <class Heir>
    void remove(uint64 shape, Heir heir) noexcept {
        Row* known = find(shape);
        if (--known->count == 0)
            _rows.erase(_rows.begin() + (known - _rows.data()));
        else
            known->sample = heir();
    }

    void replace(const Sample& former, const Sample& present) noexcept {
        for (Row& row : _rows)
            if (row.sample == former)
                row.sample = present;
    }

    void clear() noexcept { _rows.clear(); }

    // Whether an instance of another shape than the keys' might still match them. at(sample)
    // answers the sample, or null if it is gone: then nothing is sure.
    template <class At>
    bool others_may_match(const Instance* keys, const Key_Signature& signature, At at) const {
        return std::any_of(_rows.begin(), _rows.end(), [&](const Row& row) {
            if (row.shape == signature.shape)
                return false;
            const Instance* sample = at(row.sample);
            return !sample || keys_embed(keys, sample);
        });
    }

private:
    struct Row {
        uint64 shape;
        uint32 count;
        Sample sample;
    };

    Row* find(uint64 shape) noexcept {
        const auto row = std::find_if(_rows.begin(), _rows.end(),
                                      [&](const Row& r) { return r.shape == shape; });
        return row == _rows.end() ? nullptr : &*row;
    }

    std::vector<Row> _rows;
};

} // namespace cimple::detail

#endif // CIMPLE_KEY_SHAPES_H
