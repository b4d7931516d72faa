// The simulated HBA API as a vendor library, libvlnhba.so: what the SNIA's common HBA API library
// loads, by a line "org.vorlan.simulated /path/libvlnhba.so" of hba.conf, and calls through a
// table.
#include "simulator/entry_numbers.h"
#include "simulator/faces.h"

#include <cstring>
#include <ctime>
#include <hbaapi.h>
#include <vendorhbaapi.h>

namespace {

HBA_UINT32 get_version() {
    return HBA_LIBVERSION;
}

HBA_STATUS free_library() {
    return HBA_STATUS_OK;
}

// Null leaves the common library to answer "not supported".
template <class Handler>
void set_handler(Handler& handler, const char* symbol, vlnsim::Entry entry) {
    handler = reinterpret_cast<Handler>(
        vlnsim_resolve(VLNSIM_HBA, symbol, static_cast<unsigned>(entry), 1));
}

} // namespace

#define SET_HANDLER(field, function) set_handler(field, #function, vlnsim::Entry::function)

extern "C" VLNSIM_API HBA_STATUS HBA_RegisterLibrary(HBA_ENTRYPOINTS* table) {
    std::memset(table, 0, sizeof *table);
    table->GetVersionHandler = &get_version;
    table->FreeLibraryHandler = &free_library;
    SET_HANDLER(table->LoadLibraryHandler, HBA_LoadLibrary);
    SET_HANDLER(table->GetNumberOfAdaptersHandler, HBA_GetNumberOfAdapters);
    SET_HANDLER(table->GetAdapterNameHandler, HBA_GetAdapterName);
    SET_HANDLER(table->OpenAdapterHandler, HBA_OpenAdapter);
    SET_HANDLER(table->CloseAdapterHandler, HBA_CloseAdapter);
    SET_HANDLER(table->GetAdapterAttributesHandler, HBA_GetAdapterAttributes);
    SET_HANDLER(table->GetAdapterPortAttributesHandler, HBA_GetAdapterPortAttributes);
    SET_HANDLER(table->RefreshInformationHandler, HBA_RefreshInformation);
    SET_HANDLER(table->GetFcpTargetMappingHandler, HBA_GetFcpTargetMapping);
    SET_HANDLER(table->ScsiInquiryHandler, HBA_SendScsiInquiry);
    SET_HANDLER(table->ReadCapacityHandler, HBA_SendReadCapacity);
    return HBA_STATUS_OK;
}
