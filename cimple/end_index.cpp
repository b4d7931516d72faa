#include "cimple/end_index.h"

#include <tuple>

namespace cimple {

using namespace detail;

void End_Index::build(const Array<Instance*>& members) {
    _rows.clear();
    _shapes.clear();
    _complete = true;
    for (uint32 i = 0; i < members.size() && _complete; ++i)
        add_member(i, members[i]);
    std::sort(_rows.begin(), _rows.end(), [](const Row& a, const Row& b) {
        return std::tie(a.hash, a.position) < std::tie(b.hash, b.position);
    });
    // A member whose two ends are equal is listed once.
    _rows.erase(std::unique(_rows.begin(), _rows.end()), _rows.end());
}

void End_Index::add_member(uint32 position, const Instance* member) {
    for (const Meta_Feature* feature : features(member)) {
        if (!(feature->flags & FLAG_REFERENCE) || as_reference(feature)->subscript != 0)
            continue;
        if (!is_key(feature)) {
            _complete = false;
            return;
        }
        const Instance* target = reference(member, as_reference(feature));
        if (!target)
            continue; // a null reference refers to nothing
        const Key_Signature signature = key_signature(target);
        _rows.push_back({signature.hash, position});
        _shapes.add(signature.shape, {position, as_reference(feature)});
    }
}

bool End_Index::find(const Instance* end, const Array<Instance*>& members,
                     std::vector<uint32>& positions) const {
    const Key_Signature signature = key_signature(end);
    const auto at = [&](const Sample& sample) {
        return reference(members[sample.position], sample.reference);
    };
    if (!_complete || _shapes.others_may_match(end, signature, at))
        return false;
    auto row = std::lower_bound(_rows.begin(), _rows.end(), signature.hash,
                                [](const Row& r, uint64 hash) { return r.hash < hash; });
    for (; row != _rows.end() && row->hash == signature.hash; ++row)
        positions.push_back(row->position);
    return true;
}

} // namespace cimple
