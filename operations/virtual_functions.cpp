// The virtual functions of a port: who they are, and what the adapter tells of each.
#include "operations/method_wrapper.h"

#include "operations/operation_frame.h"

#include <new>

namespace cimple {

namespace {

constexpr uint32 FIRST_FUNCTIONS = 64;
constexpr char NO_MEMORY[] = "Unable to allocate the memory for the list of virtual functions";

AX_WWN wwnOf(const AX_NAME& function) {
    HBA_WWN name{};
    std::copy(std::begin(function.byte), std::end(function.byte), name.wwn);
    return cimple::wwnOf(&name);
}

} // namespace

AX_STATUS VLN_MethodWrapper::GetVirtualFuncList(const HBA_WWN* name,
                                                std::vector<AX_NAME>* functions) {
    Operation_Frame frame("VLN_MethodWrapper::GetVirtualFuncList");
    if (!frame.given(functions))
        return frame.status();
    functions->clear();
    Reply reply;
    const AX_STATUS status =
        reply.fetch({offsetof(AX_VirtualFunctionList, entry), sizeof(AX_NAME), FIRST_FUNCTIONS},
                    {NO_MEMORY}, counted<AX_VirtualFunctionList>([&](AX_VirtualFunctionList* list) {
                        return AX_GetVirtualFunctionList(cimple::wwnOf(name), list);
                    }));
    if (status != AX_STATUS_OK) {
        VLN_OPERATION_FAILED(status, "GetVirtualFuncList exited with the error code %d", status);
        return status;
    }
    try {
        const auto* list = static_cast<const AX_VirtualFunctionList*>(reply.data());
        functions->assign(list->entry, list->entry + reply.count());
    } catch (const std::bad_alloc&) {
        VLN_LOG(VLN_ERR, "%s", NO_MEMORY);
        return AX_STATUS_ERROR;
    }
    return AX_STATUS_OK;
}

AX_STATUS
VLN_MethodWrapper::GetVirtualFuncPropertyList(const HBA_WWN* name, const AX_NAME& function,
                                              AX_VirtualFunctionProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::GetVirtualFuncPropertyList");
    if (!frame.given(properties))
        return frame.status();
    const AX_STATUS status =
        AX_GetVirtualFunctionProperties(cimple::wwnOf(name), wwnOf(function), properties);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetVirtualFuncPropertyList exited with the error code %d",
                             status);
    return status;
}

} // namespace cimple
