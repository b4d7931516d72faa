// Random associations over a small set of ends, from a fixed seed, for the tests that compare a
// narrowed enumeration with a whole one.
#ifndef TESTS_CIMPLE_RANDOM_LINKS_H
#define TESTS_CIMPLE_RANDOM_LINKS_H

#include "tests/cimple/test_schema.h"

#include <random>

namespace cimple {

class Random_Links {
public:
    explicit Random_Links(uint32 seed) : _random(seed) {}

    uint32 below(uint32 limit) { return static_cast<uint32>(_random() % limit); }

    // An end of any class that a reference of the schema accepts, a null now and then.
    Instance* end(bool null_too = true) {
        switch (below(null_too ? 6 : 5)) {
        case 0:
            return base(false);
        case 1:
            return make_leaf(name());
        case 2:
            return make_stranger(name(), below(3));
        case 5:
            return nullptr;
        default:
            return base(false);
        }
    }
    Test_Base* base(bool null_too = true) {
        if (null_too && below(6) == 0)
            return nullptr;
        const char* id = name();
        Test_Base* made = below(2) ? make_base(id, below(3)) : make_base<Test_Sub>(id, below(3));
        if (below(8) == 0)
            made->Id.null = 1; // a flag that no comparison looks at
        made->Caption.set(below(2) ? "x" : "y");
        return made;
    }
    Test_Link* link() {
        Instance* left = end();
        auto* made = make_link(left, base());
        made->Weight.set(below(100));
        return made;
    }
    Test_Crowd* crowd() {
        auto* made = create_null<Test_Crowd>();
        made->Head = base();
        made->Tail = base();
        for (uint32 i = below(3); i > 0; --i)
            made->Others.append(base());
        return made;
    }

private:
    const char* name() {
        static const char* const names[] = {"a", "b", "c", "d", "A", ""};
        return names[below(6)];
    }
    std::minstd_rand _random;
};

} // namespace cimple

#endif // TESTS_CIMPLE_RANDOM_LINKS_H
