// The structures of test.mof, the schema of the engine's tests.
#ifndef TESTS_CIMPLE_TEST_SCHEMA_H
#define TESTS_CIMPLE_TEST_SCHEMA_H

#include "cimple/instance.h"
#include "classes/Test_Arrays.h"
#include "classes/Test_Chain.h"
#include "classes/Test_Crowd.h"
#include "classes/Test_Holder.h"
#include "classes/Test_Leaf.h"
#include "classes/Test_Link.h"
#include "classes/Test_Service.h"
#include "classes/Test_Stranger.h"
#include "classes/Test_Sub.h"
#include "classes/Test_Types.h"
#include "meta_repository.h"

namespace cimple {

// A Test_Base with its keys set and the rest null; a subclass of it, if it is named.
template <class C = Test_Base>
C* make_base(const char* id, uint32 slot) {
    Ref<C> base(create_null<C>());
    base->Id.set(id);
    base->Slot.set(slot);
    return base.release();
}

inline Test_Stranger* make_stranger(const char* id, uint32 slot) {
    Ref<Test_Stranger> stranger(create_null<Test_Stranger>());
    stranger->ID.set(id);
    stranger->SLOT.set(slot);
    return stranger.release();
}

inline Test_Leaf* make_leaf(const char* name) {
    Ref<Test_Leaf> leaf(create_null<Test_Leaf>());
    leaf->Name.set(name);
    return leaf.release();
}

inline Test_Link* make_link(Instance* left, Test_Base* right) {
    Test_Link* link = create_null<Test_Link>();
    link->Left = static_cast<Test_Root*>(left);
    link->Right = right;
    return link;
}

} // namespace cimple

#endif // TESTS_CIMPLE_TEST_SCHEMA_H
