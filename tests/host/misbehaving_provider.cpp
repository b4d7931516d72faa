// A provider that does one thing wrong at a time: Misbehave("how") on Test_Bad. The result is the
// code that the object manager answered to the wrong call, 0 where it answers none.

#include "tests/host/provider_kit.h"

#include <thread>

namespace {

const CMPIBroker* broker;
std::string enumeration_mode; // what the next enumeration does wrong
CMPIString* kept;             // from an earlier call

struct Wrong {
    const CMPIContext* context;
    const CMPIResult* result;
    const CMPIArgs* in;
    CMPIArgs* out;
};

CMPIString* new_string(const char* text) {
    return broker->eft->newString(broker, text, nullptr);
}

CMPIInstance* new_instance(const char* class_name) {
    return broker->eft->newInstance(broker, kit::new_path(broker, "root/test", class_name),
                                    nullptr);
}

CMPIrc set(const char* class_name, const char* property, CMPIValue value, CMPIType type) {
    CMPIInstance* inst = new_instance(class_name);
    return inst->ft->setProperty(inst, property, &value, type).rc;
}

// What reading a text answers.
CMPIrc read(const CMPIStringFT* ft, const CMPIString* string) {
    CMPIStatus status = kit::OK;
    ft->getCharPtr(string, &status);
    return status.rc;
}

CMPIrc get_from(const Wrong& wrong, const CMPIObjectPath* path) {
    CMPIStatus status = kit::OK;
    broker->bft->getInstance(broker, wrong.context, path, nullptr, &status);
    return status.rc;
}

CMPIObjectPath* path_of(const char* class_name) {
    return kit::new_path(broker, "root/test", class_name);
}

CMPIrc return_number(const Wrong& wrong, CMPIType type) {
    CMPIValue value = {.uint64 = 0};
    return wrong.result->ft->returnData(wrong.result, &value, type).rc;
}

CMPIrc put_out(const Wrong& wrong, const char* name) {
    CMPIValue value = {.uint64 = 0};
    return wrong.out->ft->addArg(wrong.out, name, &value, CMPI_uint8).rc;
}

CMPIrc on_a_thread(const Wrong& wrong, bool leaves_something, bool detaches) {
    CMPIContext* own = broker->bft->prepareAttachThread(broker, wrong.context);
    std::thread([=] {
        broker->bft->attachThread(broker, own);
        if (leaves_something)
            new_string("x");
        if (detaches)
            broker->bft->detachThread(broker, own);
    }).join();
    return CMPI_RC_OK;
}

struct Row {
    const char* how;
    CMPIrc (*act)(const Wrong& wrong);
};

#define DOES(...) [](const Wrong& wrong [[maybe_unused]]) -> CMPIrc { __VA_ARGS__ }

constexpr Row ROWS[] = {
    {"unknown property", DOES(return set("Test_Bad", "Nonsense", {.uint64 = 1}, CMPI_uint16);)},
    {"wrong type",
     DOES(return set("Test_Bad", "Level", {.string = new_string("1")}, CMPI_string);)},
    {"wild text",
     DOES(return set("Test_Bad", "Name", {.string = new_string("a\xC3(")}, CMPI_string);)},
    {"wrong width", DOES(return set("Test_Bad", "Level", {.uint64 = 1}, CMPI_uint32);)},
    {"scalar for array",
     DOES(return set("Test_Bad", "Words", {.string = new_string("1")}, CMPI_string);)},
    {"wrong reference",
     DOES(return set("Test_Link", "First",
                     {.ref = kit::new_path(broker, "root/test", "Test_Bad", "x")}, CMPI_ref);)},
    {"unknown key",
     DOES(CMPIObjectPath* path = path_of("Test_Bad"); CMPIValue value = {.uint64 = 1};
          return path->ft->addKey(path, "Level", &value, CMPI_uint16).rc;)},
    {"unknown class",
     DOES(CMPIStatus status = kit::OK;
          broker->eft->newInstance(broker, path_of("Nonsense"), &status); return status.rc;)},
    {"incomplete up-call", DOES(return get_from(wrong, path_of("Test_Platform"));)},
    {"recursion",
     DOES(return get_from(wrong, kit::new_path(broker, "root/test", "Test_Bad", "x"));)},
    {"leak of a clone", DOES(const CMPIString* string = new_string("never released");
                             string->ft->clone(string, nullptr); return CMPI_RC_OK;)},
    {"leak of a context",
     DOES(broker->bft->prepareAttachThread(broker, wrong.context); return CMPI_RC_OK;)},
    {"double release",
     DOES(CMPIString* string = new_string("x"); const CMPIStringFT* ft = string->ft;
          ft->release(string); return ft->release(string).rc;)},
    {"use after release",
     DOES(CMPIString* string = new_string("x"); const CMPIStringFT* ft = string->ft;
          ft->release(string); return read(ft, string);)},
    {"keep", DOES(kept = new_string("kept"); return CMPI_RC_OK;)},
    {"use after call", DOES(return read(kept->ft, kept);)},
    {"foreign object", DOES(CMPIString own = *new_string("x"); return read(own.ft, &own);)},
    {"overwritten object", DOES(CMPIString* string = new_string("x"); string->hdl = &string;
                                return read(string->ft, string);)},
    {"other kind",
     DOES(return read(new_string("x")->ft, reinterpret_cast<const CMPIString*>(wrong.context));)},
    {"release of a parameter",
     DOES(return wrong.context->ft->release(const_cast<CMPIContext*>(wrong.context)).rc;)},
    // What an object contains goes with it.
    {"release of contents",
     DOES(const CMPIData how = wrong.in->ft->getArg(wrong.in, "How", nullptr);
          return how.value.string->ft->release(how.value.string).rc;)},
    {"stale element",
     DOES(CMPIArray* array = broker->eft->newArray(broker, 1, CMPI_string, nullptr);
          CMPIValue value = {.string = new_string("x")};
          array->ft->setElementAt(array, 0, &value, CMPI_string);
          value.string->ft->release(value.string);
          return set("Test_Bad", "Words", {.array = array}, CMPI_stringA);)},
    {"index out of range",
     DOES(CMPIArray* array = broker->eft->newArray(broker, 1, CMPI_uint8, nullptr);
          CMPIValue value = {.uint64 = 1};
          return array->ft->setElementAt(array, 1, &value, CMPI_uint8).rc;)},
    {"null text", DOES(CMPIStatus status = kit::OK;
                       broker->eft->newString(broker, nullptr, &status); return status.rc;)},
    {"bad datetime", DOES(CMPIStatus status = kit::OK; broker->eft->newDateTimeFromChars(
                         broker, "20240230120000.000000+000", &status);
                          return status.rc;)},
    {"result twice",
     DOES(return_number(wrong, CMPI_uint32); return return_number(wrong, CMPI_uint32);)},
    {"result of other type", DOES(return return_number(wrong, CMPI_uint16);)},
    {"result of other kind",
     DOES(return wrong.result->ft->returnInstance(wrong.result, new_instance("Test_Bad")).rc;)},
    {"unknown output", DOES(return put_out(wrong, "How");)},
    {"output of other type", DOES(return put_out(wrong, "Output");)},
    {"unattached thread", DOES(std::thread([] { new_string("x"); }).join(); return CMPI_RC_OK;)},
    {"undetached thread", DOES(return on_a_thread(wrong, false, false);)},
    {"left at detach", DOES(return on_a_thread(wrong, true, true);)},
    {"attached twice", DOES(return broker->bft->attachThread(broker, wrong.context).rc;)},
};

CMPIStatus method_cleanup(CMPIMethodMI*, const CMPIContext*, CMPIBoolean) {
    return kit::OK;
}

CMPIStatus invoke(CMPIMethodMI*, const CMPIContext* context, const CMPIResult* result,
                  const CMPIObjectPath*, const char*, const CMPIArgs* in, CMPIArgs* out) {
    const std::string how = kit::argument(in, "How");
    enumeration_mode = how;
    for (const Row& row : ROWS)
        if (how == row.how) {
            const CMPIrc rc = row.act({context, result, in, out});
            return how.starts_with("result")
                       ? kit::OK
                       : kit::answer_number(result, static_cast<CMPIUint32>(rc));
        }
    return kit::answer_number(result, 0);
}

// ---- Enumerations that go wrong ----

CMPIStatus cleanup(CMPIInstanceMI*, const CMPIContext*, CMPIBoolean terminating) {
    return {terminating ? CMPI_RC_OK : CMPI_RC_DO_NOT_UNLOAD, nullptr};
}

CMPIStatus enumerate_names(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                           const CMPIObjectPath*) {
    const char* class_name = enumeration_mode == "enumerate unknown class" ? "Nonsense"
                             : enumeration_mode == "enumerate other class" ? "Test_Platform"
                                                                           : "Test_Bad";
    CMPIObjectPath* path = kit::new_path(broker, "root/test", class_name);
    if (enumeration_mode == "enumerate after done")
        result->ft->returnDone(result);
    if (enumeration_mode != "enumerate missing key")
        path = kit::new_path(broker, "root/test", class_name, "x");
    return result->ft->returnObjectPath(result, path);
}

CMPIStatus enumerate(CMPIInstanceMI*, const CMPIContext*, const CMPIResult* result,
                     const CMPIObjectPath*, const char**) {
    return result->ft->returnInstance(result, new_instance("Test_Bad"));
}

CMPIInstanceMIFT instance_table = {100,     100,     "bad",   cleanup, enumerate_names, enumerate,
                                   nullptr, nullptr, nullptr, nullptr, nullptr};
CMPIMethodMIFT method_table = {100, 100, "bad", method_cleanup, invoke};
CMPIInstanceMI instance_mi = {nullptr, &instance_table};
CMPIMethodMI method_mi = {nullptr, &method_table};

} // namespace

KIT_EXPORT CMPIInstanceMI* Test_Bad_Provider_Create_InstanceMI(const CMPIBroker* given,
                                                               const CMPIContext*, CMPIStatus*) {
    broker = given;
    return &instance_mi;
}

KIT_EXPORT CMPIMethodMI* Test_Bad_Provider_Create_MethodMI(const CMPIBroker* given,
                                                           const CMPIContext*, CMPIStatus*) {
    broker = given;
    return &method_mi;
}
