// The method interface.
#include "cimple/cmpi_frame.h"

namespace cimple {

namespace {

constexpr Status_Row INVOKE_METHOD_STATUS[] = {
    {INVOKE_METHOD_FAILED, CMPI_RC_ERR_FAILED},
    {INVOKE_METHOD_UNSUPPORTED, CMPI_RC_ERR_NOT_SUPPORTED},
    {INVOKE_METHOD_ACCESS_DENIED, CMPI_RC_ERR_ACCESS_DENIED},
};

// Output parameters into out, the return value into the result.
int return_outputs(const Call& call, const CMPIResult* result, const String& name_space,
                   const Instance* method, CMPIArgs* out) {
    CMPIValue value;
    CMPIType type;
    const int rc = make_method_out(call.broker, name_space.c_str(), method, out, value, type);
    if (rc != CMPI_RC_OK)
        return rc;
    if (type != CMPI_null) // the interface has no way to return a null value
        cmpi::return_data(result, value, type);
    cmpi::return_done(result);
    return CMPI_RC_OK;
}

CMPIStatus invoke_method(CMPIMethodMI* mi, const CMPIContext* context, const CMPIResult* result,
                         const CMPIObjectPath* path, const char* name, const CMPIArgs* in,
                         CMPIArgs* out) {
    return run_call(mi, context, "invokeMethod", [&](const Call& call) -> Answer {
        const Meta_Class* meta_class = call.find_class(path);
        if (!meta_class)
            return {CMPI_RC_ERR_FAILED, "MetaClass not found"};
        const auto* meta_method =
            static_cast<const Meta_Method*>(find_feature(meta_class, name, FLAG_METHOD));
        if (!meta_method)
            return {CMPI_RC_ERR_METHOD_NOT_FOUND, name ? name : ""};
        // The class's name against the method's own: only a method named like its class is refused.
        // It has always been so, and is meant to stay.
        if (name_equal(cmpi::class_name(path).c_str(), meta_method->name))
            return CMPI_RC_ERR_INVALID_CLASS;

        const Converter converter = call.converter(cmpi::name_space(path));
        const Ref<Instance> self = make_cimple_reference(converter, meta_class, path);
        const Ref<Instance> method = make_method_instance(converter, meta_method, in);
        const sint32 status = call.provider(OP_INVOKE_METHOD, self.get(), method.get());
        const int rc = map_status(INVOKE_METHOD_STATUS, status);
        return rc != CMPI_RC_OK
                   ? rc
                   : return_outputs(call, result, converter.name_space, method.get(), out);
    });
}

} // namespace

const CMPIMethodMIFT METHOD_FUNCTIONS = {
    CMPICurrentVersion, CMPICurrentVersion, nullptr, cleanup<CMPIMethodMI>, invoke_method,
};

} // namespace cimple
