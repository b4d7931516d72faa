#include "agent/associations.h"

namespace cimple {

namespace {

// Sets the next reference of the association, from the given feature on, to a share of the end.
// Answers the feature after it, or -1 if there is none left or the end does not fit.
sint32 set_reference(Instance* association, uint32 feature, const Instance* end) {
    const Meta_Class* meta_class = association->__meta_class;
    for (; feature < meta_class->num_meta_features; ++feature) {
        const Meta_Feature* candidate = meta_class->meta_features[feature];
        if (!(candidate->flags & FLAG_REFERENCE))
            continue;
        const auto* description = static_cast<const Meta_Reference*>(candidate);
        if (!is_subclass(description->meta_class, end->__meta_class))
            return -1;
        // An instance's references are not const, but what they share is as good as that.
        ref(end);
        reference(association, description) = const_cast<Instance*>(end);
        return static_cast<sint32>(feature + 1);
    }
    return -1;
}

bool set_ends(Instance* association, Association_Ends ends) {
    sint32 feature = 0;
    for (const Instance* end : ends) {
        if (end)
            feature = set_reference(association, static_cast<uint32>(feature), end);
        if (!end || feature < 0)
            return false;
    }
    return true;
}

} // namespace

Instance* make_instance(const Meta_Class* meta_class) {
    static const String name_space(VORLAN_NAME_SPACE);
    Instance* instance = create_null(meta_class);
    instance->__name_space = name_space;
    return instance;
}

const Instance* insert_instance(Instance_Map_Base& store, Ref<Instance> instance,
                                const Insert_Failure& failure) {
    if (!instance)
        return nullptr;
    if (store.insert(instance.get()) >= 0)
        return instance.release();
    if (failure.text)
        VLN_LOG(failure.level, "%s", failure.text);
    else
        VLN_LOG(failure.level, "Insert Failed : m_%s_map", store.meta_class()->name);
    return nullptr;
}

Ref<Instance> association_of(const Meta_Class* meta_class, Association_Ends ends) {
    Ref<Instance> association(make_instance(meta_class));
    if (!association) {
        VLN_LOG(VLN_CRIT, "Could not create the instance of the Association class");
    } else if (!set_ends(association.get(), ends)) {
        VLN_LOG(VLN_CRIT, "Wrong input for %s", meta_class->name);
        return {};
    }
    return association;
}

const Instance* associate(Instance_Map_Base& store, Association_Ends ends,
                          const Insert_Failure& failure, const Association_Details& details) {
    auto association = association_of(store.meta_class(), ends);
    if (association && details)
        details(*association);
    return insert_instance(store, std::move(association), failure);
}

const Instance* associate(Instance_Map_Base& store, const Instance* first, const Instance* second,
                          const Insert_Failure& failure, const Association_Details& details) {
    return associate(store, {first, second}, failure, details);
}

const Instance* associate_once(Instance_Map_Base& store, const Instance* first,
                               const Instance* second, const Insert_Failure& failure,
                               const Association_Details& details) {
    auto association = association_of(store.meta_class(), {first, second});
    if (association && store.lookup(association.get()))
        return nullptr;
    if (association && details)
        details(*association);
    return insert_instance(store, std::move(association), failure);
}

const Instance* associate_as(Instance_Map_Base& store, const String& text, const Instance* first,
                             const Instance* second, const Insert_Failure& failure,
                             const Association_Details& details) {
    VLN_LOG(VLN_DBG, "Generating %s (%s)", store.meta_class()->name, text.c_str());
    return associate(store, first, second, failure, details);
}

} // namespace cimple
