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

CMPIrc unknown_property(const Wrong&) {
    return set("Test_Bad", "Nonsense", {.uint64 = 1}, CMPI_uint16);
}

CMPIrc wrong_type(const Wrong&) {
    return set("Test_Bad", "Level", {.string = new_string("1")}, CMPI_string);
}

CMPIrc wild_text(const Wrong&) {
    return set("Test_Bad", "Name", {.string = new_string("a\xC3(")}, CMPI_string);
}

CMPIrc wrong_width(const Wrong&) {
    return set("Test_Bad", "Level", {.uint64 = 1}, CMPI_uint32);
}

CMPIrc scalar_for_array(const Wrong&) {
    return set("Test_Bad", "Words", {.string = new_string("1")}, CMPI_string);
}

CMPIrc wrong_reference(const Wrong&) {
    return set("Test_Link", "First", {.ref = kit::new_path(broker, "root/test", "Test_Bad", "x")},
               CMPI_ref);
}

CMPIrc unknown_key(const Wrong&) {
    CMPIObjectPath* path = kit::new_path(broker, "root/test", "Test_Bad");
    CMPIValue value = {.uint64 = 1};
    return path->ft->addKey(path, "Level", &value, CMPI_uint16).rc;
}

CMPIrc unknown_class(const Wrong&) {
    CMPIStatus status = kit::OK;
    CMPIObjectPath* path = kit::new_path(broker, "root/test", "Nonsense");
    broker->eft->newInstance(broker, path, &status);
    return status.rc;
}

CMPIrc incomplete_up_call(const Wrong& wrong) {
    CMPIStatus status = kit::OK;
    CMPIObjectPath* path = kit::new_path(broker, "root/test", "Test_Platform");
    broker->bft->getInstance(broker, wrong.context, path, nullptr, &status);
    return status.rc;
}

CMPIrc recursion(const Wrong& wrong) {
    CMPIStatus status = kit::OK;
    CMPIObjectPath* path = kit::new_path(broker, "root/test", "Test_Bad", "x");
    broker->bft->getInstance(broker, wrong.context, path, nullptr, &status);
    return status.rc;
}

CMPIrc leak_clone(const Wrong&) {
    const CMPIString* string = new_string("never released");
    string->ft->clone(string, nullptr);
    return CMPI_RC_OK;
}

CMPIrc leak_context(const Wrong& wrong) {
    broker->bft->prepareAttachThread(broker, wrong.context);
    return CMPI_RC_OK;
}

CMPIrc double_release(const Wrong&) {
    CMPIString* string = new_string("x");
    const CMPIStringFT* ft = string->ft;
    ft->release(string);
    return ft->release(string).rc;
}

CMPIrc use_after_release(const Wrong&) {
    CMPIString* string = new_string("x");
    const CMPIStringFT* ft = string->ft;
    ft->release(string);
    CMPIStatus status = kit::OK;
    ft->getCharPtr(string, &status);
    return status.rc;
}

CMPIrc keep(const Wrong&) {
    kept = new_string("kept");
    return CMPI_RC_OK;
}

CMPIrc use_after_call(const Wrong&) {
    CMPIStatus status = kit::OK;
    kept->ft->getCharPtr(kept, &status);
    return status.rc;
}

CMPIrc foreign_object(const Wrong&) {
    CMPIString own = *new_string("x");
    CMPIStatus status = kit::OK;
    own.ft->getCharPtr(&own, &status);
    return status.rc;
}

CMPIrc overwritten_object(const Wrong&) {
    CMPIString* string = new_string("x");
    string->hdl = &string;
    CMPIStatus status = kit::OK;
    string->ft->getCharPtr(string, &status);
    return status.rc;
}

CMPIrc other_kind(const Wrong& wrong) {
    CMPIStatus status = kit::OK;
    const CMPIString* string = new_string("x");
    string->ft->getCharPtr(reinterpret_cast<const CMPIString*>(wrong.context), &status);
    return status.rc;
}

CMPIrc release_parameter(const Wrong& wrong) {
    return wrong.context->ft->release(const_cast<CMPIContext*>(wrong.context)).rc;
}

// What an object contains goes with it.
CMPIrc release_contents(const Wrong& wrong) {
    const CMPIData how = wrong.in->ft->getArg(wrong.in, "How", nullptr);
    return how.value.string->ft->release(how.value.string).rc;
}

CMPIrc stale_element(const Wrong&) {
    CMPIArray* array = broker->eft->newArray(broker, 1, CMPI_string, nullptr);
    CMPIString* string = new_string("x");
    CMPIValue value = {.string = string};
    array->ft->setElementAt(array, 0, &value, CMPI_string);
    string->ft->release(string);
    return set("Test_Bad", "Words", {.array = array}, CMPI_stringA);
}

CMPIrc index_out_of_range(const Wrong&) {
    CMPIArray* array = broker->eft->newArray(broker, 1, CMPI_uint8, nullptr);
    CMPIValue value = {.uint64 = 1};
    return array->ft->setElementAt(array, 1, &value, CMPI_uint8).rc;
}

CMPIrc null_text(const Wrong&) {
    CMPIStatus status = kit::OK;
    broker->eft->newString(broker, nullptr, &status);
    return status.rc;
}

CMPIrc bad_datetime(const Wrong&) {
    CMPIStatus status = kit::OK;
    broker->eft->newDateTimeFromChars(broker, "20240230120000.000000+000", &status);
    return status.rc;
}

CMPIrc result_twice(const Wrong& wrong) {
    CMPIValue value = {.uint64 = 0};
    wrong.result->ft->returnData(wrong.result, &value, CMPI_uint32);
    return wrong.result->ft->returnData(wrong.result, &value, CMPI_uint32).rc;
}

CMPIrc result_of_other_type(const Wrong& wrong) {
    CMPIValue value = {.uint64 = 0};
    return wrong.result->ft->returnData(wrong.result, &value, CMPI_uint16).rc;
}

CMPIrc result_of_other_kind(const Wrong& wrong) {
    return wrong.result->ft->returnInstance(wrong.result, new_instance("Test_Bad")).rc;
}

CMPIrc unknown_output(const Wrong& wrong) {
    CMPIValue value = {.uint64 = 0};
    return wrong.out->ft->addArg(wrong.out, "How", &value, CMPI_uint8).rc;
}

CMPIrc output_of_other_type(const Wrong& wrong) {
    CMPIValue value = {.uint64 = 0};
    return wrong.out->ft->addArg(wrong.out, "Output", &value, CMPI_uint8).rc;
}

CMPIrc unattached_thread(const Wrong&) {
    std::thread([] { new_string("x"); }).join();
    return CMPI_RC_OK;
}

CMPIrc undetached_thread(const Wrong& wrong) {
    CMPIContext* own = broker->bft->prepareAttachThread(broker, wrong.context);
    std::thread([own] { broker->bft->attachThread(broker, own); }).join();
    return CMPI_RC_OK;
}

CMPIrc left_at_detach(const Wrong& wrong) {
    CMPIContext* own = broker->bft->prepareAttachThread(broker, wrong.context);
    std::thread([own] {
        broker->bft->attachThread(broker, own);
        new_string("x");
        broker->bft->detachThread(broker, own);
    }).join();
    return CMPI_RC_OK;
}

CMPIrc attached_twice(const Wrong& wrong) {
    return broker->bft->attachThread(broker, wrong.context).rc;
}

struct Row {
    const char* how;
    CMPIrc (*act)(const Wrong& wrong);
};

constexpr Row ROWS[] = {
    {"unknown property", unknown_property},
    {"wrong type", wrong_type},
    {"wild text", wild_text},
    {"wrong width", wrong_width},
    {"scalar for array", scalar_for_array},
    {"wrong reference", wrong_reference},
    {"unknown key", unknown_key},
    {"unknown class", unknown_class},
    {"incomplete up-call", incomplete_up_call},
    {"recursion", recursion},
    {"leak of a clone", leak_clone},
    {"leak of a context", leak_context},
    {"double release", double_release},
    {"use after release", use_after_release},
    {"keep", keep},
    {"use after call", use_after_call},
    {"foreign object", foreign_object},
    {"overwritten object", overwritten_object},
    {"other kind", other_kind},
    {"release of a parameter", release_parameter},
    {"release of contents", release_contents},
    {"stale element", stale_element},
    {"index out of range", index_out_of_range},
    {"null text", null_text},
    {"bad datetime", bad_datetime},
    {"result twice", result_twice},
    {"result of other type", result_of_other_type},
    {"result of other kind", result_of_other_kind},
    {"unknown output", unknown_output},
    {"output of other type", output_of_other_type},
    {"unattached thread", unattached_thread},
    {"undetached thread", undetached_thread},
    {"left at detach", left_at_detach},
    {"attached twice", attached_twice},
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
