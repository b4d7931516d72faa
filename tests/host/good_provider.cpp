// A provider that keeps to the interface: a store of Test_Good, links between them, methods.

#include "tests/host/provider_kit.h"

#include <map>
#include <mutex>
#include <thread>

namespace {

const CMPIBroker* broker;

// Name to level; three to begin with.
std::mutex store_mutex;
std::map<std::string, CMPIUint16> store = {{"a", 1}, {"b", 2}, {"c \"quoted\", and\\more", 3}};

std::map<std::string, CMPIUint16> snapshot() {
    const std::lock_guard lock(store_mutex);
    return store;
}

void set(CMPIInstance* inst, const char* name, CMPIValue value, CMPIType type) {
    inst->ft->setProperty(inst, name, &value, type);
}

void set_words(CMPIInstance* inst) {
    CMPIArray* words = broker->eft->newArray(broker, 3, CMPI_string, nullptr);
    const char* texts[] = {"one", "two,three"};
    for (CMPICount i = 0; i < 2; ++i) {
        const CMPIValue value = {.string = broker->eft->newString(broker, texts[i], nullptr)};
        words->ft->setElementAt(words, i, &value, CMPI_string);
    }
    set(inst, "Words", {.array = words}, CMPI_stringA);
}

CMPIInstance* new_instance(const std::string& name_space, const std::string& name, CMPIUint16 level,
                           const char** properties) {
    CMPIObjectPath* path = kit::new_path(broker, name_space, "Test_Good", name);
    CMPIInstance* inst = broker->eft->newInstance(broker, path, nullptr);
    const char* keys[] = {"Name", nullptr};
    inst->ft->setPropertyFilter(inst, properties, keys);
    set(inst, "Name", {.string = broker->eft->newString(broker, name.c_str(), nullptr)},
        CMPI_string);
    set(inst, "Level", {.uint16 = level}, CMPI_uint16);
    set(inst, "Big", {.uint64 = 18446744073709551615ull}, CMPI_uint64);
    set(inst, "Offset", {.sint16 = -5}, CMPI_sint16);
    set(inst, "Ratio", {.real32 = 0.1f}, CMPI_real32);
    set(inst, "Flag", {.boolean = 1}, CMPI_boolean);
    set(inst, "When", {.dateTime = broker->eft->newDateTimeFromBinary(broker, 1000000, 0, nullptr)},
        CMPI_dateTime);
    set_words(inst);
    inst->ft->setProperty(inst, "Note", nullptr, CMPI_string);
    return inst;
}

// ---- Instances ----

template <class MI>
CMPIStatus nothing_to_clean_up(MI*, const CMPIContext*, CMPIBoolean) {
    return kit::OK;
}

CMPIStatus enumerate_names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* op) {
    for (const auto& [name, level] : snapshot()) {
        CMPIObjectPath* path = kit::new_path(broker, kit::name_space_of(op), "Test_Good", name);
        result->ft->returnObjectPath(result, path);
        path->ft->release(path);
    }
    return result->ft->returnDone(result);
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath* op, const char** properties) {
    for (const auto& [name, level] : snapshot())
        result->ft->returnInstance(result,
                                   new_instance(kit::name_space_of(op), name, level, properties));
    return result->ft->returnDone(result);
}

std::string name_of(const CMPIObjectPath* op) {
    return kit::text(op->ft->getKey(op, "Name", nullptr).value.string);
}

CMPIStatus get(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
               const CMPIObjectPath* op, const char** properties) {
    const auto instances = snapshot();
    const auto found = instances.find(name_of(op));
    if (found == instances.end())
        return {CMPI_RC_ERR_NOT_FOUND, broker->eft->newString(broker, "no such name", nullptr)};
    result->ft->returnInstance(
        result, new_instance(kit::name_space_of(op), found->first, found->second, properties));
    return result->ft->returnDone(result);
}

CMPIStatus change(const CMPIResult* result, const CMPIObjectPath* op, const CMPIInstance* inst,
                  bool exists) {
    const std::string name = kit::text(inst->ft->getProperty(inst, "Name", nullptr).value.string);
    const CMPIData level = inst->ft->getProperty(inst, "Level", nullptr);
    const std::lock_guard lock(store_mutex);
    if (store.contains(name) != exists)
        return {exists ? CMPI_RC_ERR_NOT_FOUND : CMPI_RC_ERR_ALREADY_EXISTS, nullptr};
    store[name] = level.state & CMPI_nullValue ? CMPIUint16{0} : level.value.uint16;
    result->ft->returnObjectPath(result,
                                 kit::new_path(broker, kit::name_space_of(op), "Test_Good", name));
    return result->ft->returnDone(result);
}

CMPIStatus create(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                  const CMPIObjectPath* op, const CMPIInstance* inst) {
    return change(result, op, inst, false);
}

CMPIStatus modify(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                  const CMPIObjectPath* op, const CMPIInstance* inst, const char**) {
    return change(result, op, inst, true);
}

CMPIStatus remove(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                  const CMPIObjectPath* op) {
    const std::lock_guard lock(store_mutex);
    if (store.erase(name_of(op)) == 0)
        return {CMPI_RC_ERR_NOT_FOUND, nullptr};
    return result->ft->returnDone(result);
}

CMPIStatus query(CMPIInstanceMI*, const CMPIContext*, const CMPIResult*, const CMPIObjectPath*,
                 const char*, const char*) {
    return {CMPI_RC_ERR_NOT_SUPPORTED, nullptr};
}

CMPIInstanceMIFT instance_table = {
    100,    100,    "good", nothing_to_clean_up, enumerate_names, enumerate, get, create,
    modify, remove, query};

// ---- Methods ----

void copy_argument(const CMPIArgs* in, CMPIArgs* out, const char* from, const char* to) {
    const CMPIData data = in->ft->getArg(in, from, nullptr);
    if (data.state == CMPI_goodValue)
        out->ft->addArg(out, to, &data.value, data.type);
}

CMPIUint32 count_of(const CMPIContext* context, const std::string& name_space,
                    const std::string& class_name) {
    CMPIStatus status = kit::OK;
    CMPIObjectPath* path = kit::new_path(broker, name_space, class_name.c_str());
    CMPIEnumeration* all = broker->bft->enumerateInstances(broker, context, path, nullptr, &status);
    path->ft->release(path);
    if (status.msg)
        status.msg->ft->release(status.msg);
    if (status.rc != CMPI_RC_OK)
        return 1000 + static_cast<CMPIUint32>(status.rc);
    CMPIUint32 count = 0;
    while (all->ft->hasNext(all, nullptr)) {
        const CMPIData data = all->ft->getNext(all, nullptr);
        count += data.type == CMPI_instance;
    }
    all->ft->release(all);
    return count;
}

CMPIUint32 count_on_thread(const CMPIContext* context, const std::string& name_space,
                           const std::string& class_name) {
    CMPIContext* own = broker->bft->prepareAttachThread(broker, context);
    CMPIUint32 count = 0;
    std::thread([&] {
        broker->bft->attachThread(broker, own);
        count = count_of(own, name_space, class_name);
        broker->bft->detachThread(broker, own);
    }).join();
    return count;
}

CMPIStatus invoke(CMPIMethodMI*, const CMPIContext* context, const CMPIResult* result,
                  const CMPIObjectPath*, const char* method, const CMPIArgs* in, CMPIArgs* out) {
    const std::string name = method;
    if (name == "Echo") {
        copy_argument(in, out, "Number", "NumberOut");
        copy_argument(in, out, "Words", "WordsOut");
        copy_argument(in, out, "Who", "WhoOut");
        return kit::answer_number(result, 0);
    }
    if (name == "CountOf") {
        const CMPIData on_thread = in->ft->getArg(in, "OnThread", nullptr);
        const auto count = on_thread.value.boolean ? count_on_thread : count_of;
        return kit::answer_number(
            result, count(context, kit::argument(in, "NameSpace"), kit::argument(in, "ClassName")));
    }
    return kit::answer_number(result, 42);
}

CMPIMethodMIFT method_table = {100, 100, "good", nothing_to_clean_up, invoke};

// ---- Associations: each instance is linked to the next one ----

// Calls visit(first, second) for each link that has the instance at an end in the role.
template <class Visit>
void for_each_link(const CMPIObjectPath* op, const char* role, Visit visit) {
    const std::string name = name_of(op), wanted = role ? role : "";
    std::string previous;
    for (const auto& [next, level] : snapshot()) {
        const bool first = previous == name && wanted != "Second";
        const bool second = next == name && wanted != "First";
        if (!previous.empty() && (first || second))
            visit(previous, next);
        previous = next;
    }
}

CMPIStatus associators(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                       const CMPIObjectPath* op, const char*, const char*, const char* role,
                       const char*, const char** properties) {
    for_each_link(op, role, [&](const std::string& first, const std::string& second) {
        const std::string& other = first == name_of(op) ? second : first;
        result->ft->returnInstance(result,
                                   new_instance(kit::name_space_of(op), other, 0, properties));
    });
    return kit::OK;
}

CMPIStatus associator_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                            const CMPIObjectPath* op, const char*, const char*, const char* role,
                            const char*) {
    for_each_link(op, role, [&](const std::string& first, const std::string& second) {
        const std::string& other = first == name_of(op) ? second : first;
        result->ft->returnObjectPath(
            result, kit::new_path(broker, kit::name_space_of(op), "Test_Good", other));
    });
    return kit::OK;
}

CMPIObjectPath* link_path(const CMPIObjectPath* op, const std::string& first,
                          const std::string& second) {
    const std::string name_space = kit::name_space_of(op);
    CMPIObjectPath* path = kit::new_path(broker, name_space, "Test_Link");
    CMPIValue value;
    value.ref = kit::new_path(broker, name_space, "Test_Good", first);
    path->ft->addKey(path, "First", &value, CMPI_ref);
    value.ref = kit::new_path(broker, name_space, "Test_Good", second);
    path->ft->addKey(path, "Second", &value, CMPI_ref);
    return path;
}

CMPIStatus references(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                      const CMPIObjectPath* op, const char*, const char* role, const char**) {
    for_each_link(op, role, [&](const std::string& first, const std::string& second) {
        CMPIInstance* inst =
            broker->eft->newInstance(broker, link_path(op, first, second), nullptr);
        set(inst, "Strength", {.uint16 = 7}, CMPI_uint16);
        result->ft->returnInstance(result, inst);
    });
    return kit::OK;
}

CMPIStatus reference_names(CMPIAssociationMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath* op, const char*, const char* role) {
    for_each_link(op, role, [&](const std::string& first, const std::string& second) {
        result->ft->returnObjectPath(result, link_path(op, first, second));
    });
    return kit::OK;
}

CMPIAssociationMIFT association_table = {100,         100,
                                         "good",      nothing_to_clean_up,
                                         associators, associator_names,
                                         references,  reference_names};

CMPIInstanceMI instance_mi = {nullptr, &instance_table};
CMPIMethodMI method_mi = {nullptr, &method_table};
CMPIAssociationMI association_mi = {nullptr, &association_table};

} // namespace

KIT_EXPORT CMPIInstanceMI* Test_Good_Provider_Create_InstanceMI(const CMPIBroker* given,
                                                                const CMPIContext*, CMPIStatus*) {
    broker = given;
    return &instance_mi;
}

KIT_EXPORT CMPIMethodMI* Test_Good_Provider_Create_MethodMI(const CMPIBroker* given,
                                                            const CMPIContext*, CMPIStatus*) {
    broker = given;
    return &method_mi;
}

KIT_EXPORT CMPIAssociationMI*
Test_Link_Provider_Create_AssociationMI(const CMPIBroker* given, const CMPIContext*, CMPIStatus*) {
    broker = given;
    return &association_mi;
}
