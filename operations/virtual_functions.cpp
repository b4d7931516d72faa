// The virtual functions of a port: who they are, and what the adapter tells of each.
#include "operations/method_wrapper.h"

#include "operations/operation_frame.h"

namespace cimple {

namespace {

constexpr uint32 FIRST_FUNCTIONS = 64;
constexpr char NO_MEMORY[] = "Unable to allocate the memory for the list of virtual functions";

} // namespace

AX_STATUS VLN_MethodWrapper::GetVirtualFuncList(const HBA_WWN* name,
                                                std::vector<AX_NAME>* functions) {
    Operation_Frame frame("VLN_MethodWrapper::GetVirtualFuncList");
    if (!frame.given(functions))
        return frame.status();
    const AX_STATUS status = fetch_list<AX_VirtualFunctionList>(
        functions, FIRST_FUNCTIONS, {NO_MEMORY},
        [&](AX_VirtualFunctionList* list) { return AX_GetVirtualFunctionList(wwnOf(name), list); });
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetVirtualFuncList exited with the error code %d", status);
    return status;
}

AX_STATUS
VLN_MethodWrapper::GetVirtualFuncPropertyList(const HBA_WWN* name, const AX_NAME& function,
                                              AX_VirtualFunctionProperties* properties) {
    Operation_Frame frame("VLN_MethodWrapper::GetVirtualFuncPropertyList");
    if (!frame.given(properties))
        return frame.status();
    const AX_STATUS status =
        AX_GetVirtualFunctionProperties(wwnOf(name), wwnOf(function), properties);
    if (status != AX_STATUS_OK)
        VLN_OPERATION_FAILED(status, "GetVirtualFuncPropertyList exited with the error code %d",
                             status);
    return status;
}

} // namespace cimple
