// Running out of memory at every single allocation: the operation throws and leaves nothing behind.
// What it would leave, the address sanitizer's leak check finds.
#include "cimple/instance_map.h"
#include "tests/cimple/test_schema.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <new>

namespace {

thread_local long allocations_left = -1; // negative: no limit

bool may_allocate() {
    if (allocations_left > 0)
        --allocations_left;
    else if (allocations_left == 0)
        return false;
    return true;
}

} // namespace

// The linker leads malloc and realloc of everything in this program here.
extern "C" void* __real_malloc(std::size_t size);
extern "C" void* __real_realloc(void* block, std::size_t size);
extern "C" void* __wrap_malloc(std::size_t size) {
    return may_allocate() ? __real_malloc(size) : nullptr;
}
extern "C" void* __wrap_realloc(void* block, std::size_t size) {
    return may_allocate() ? __real_realloc(block, size) : nullptr;
}

// Not inlined: a compiler that sees malloc behind new takes free behind delete for a mistake.
[[gnu::noinline]] void* operator new(std::size_t size) {
    if (void* block = std::malloc(size))
        return block;
    throw std::bad_alloc();
}
[[gnu::noinline]] void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return std::malloc(size);
}
[[gnu::noinline]] void operator delete(void* block) noexcept {
    std::free(block);
}
[[gnu::noinline]] void operator delete(void* block, std::size_t) noexcept {
    std::free(block);
}

namespace cimple {
namespace {

void work_with_instances() {
    Ref<Test_Types> types(create<Test_Types>(true));
    types->Str.set("text");
    types->Dates.append(Datetime(1, 2, true));
    Ref<Test_Holder> holder(create_null<Test_Holder>());
    holder->Object = make_base("inner", 1);
    Ref<Test_Base> element(make_base("one", 1));
    holder->Objects.append(element.get());
    element.release();
    holder->Objects.append(nullptr);
    Ref<Test_Types> second(clone(types.get()));
    Ref<Test_Holder> third(clone(holder.get()));
    copy(second.get(), types.get());
    copy(third.get(), holder.get());
    types->Names.append(types->Names.value[0]);
    clear(third.get());
    Ref<Test_Base> keys(make_base("r", 3));
    String path;
    instance_to_model_path(keys.get(), path);
    Ref<Instance> read(model_path_to_instance(keys->__meta_class, path.c_str()));
}

void work_with_store() {
    Instance_Map<Test_Base> map;
    for (uint32 i = 0; i < 40; ++i) {
        Ref<Test_Base> member(make_base("m", i));
        map.create_instance(member.get());
        if (i % 3 == 0)
            map.delete_instance(member.get());
    }
}

void work_with_classes() {
    for (const Meta_Class* base : {&Test_Service::static_meta_class, &Test_Root::static_meta_class,
                                   &Test_Types::static_meta_class}) {
        Meta_Class* made = create_meta_class("Made", base, 0);
        remove_qualifiers(made, nullptr, 0);
        unref(made);
    }
}

TEST(Memory, RunningOutAnywhereLeavesNothingBehind) {
    for (const auto work : {work_with_instances, work_with_store, work_with_classes}) {
        bool finished = false;
        long limit = 0;
        for (; !finished && limit < 10000; ++limit) {
            allocations_left = limit;
            try {
                work();
                finished = true;
            } catch (const std::bad_alloc&) {
            }
            allocations_left = -1;
        }
        EXPECT_TRUE(finished);
        EXPECT_GT(limit, 10); // it did run out on the way
    }
}

} // namespace
} // namespace cimple
