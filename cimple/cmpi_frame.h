// What the CMPI functions of all four interfaces share: the frame of a call, the call of the
// provider procedure, the mapping of its status, and the delivery of results.
#ifndef CIMPLE_CMPI_FRAME_H
#define CIMPLE_CMPI_FRAME_H

#include "cimple/cmpi_adapter.h"
#include "cimple/cmpi_call.h"
#include "cimple/conversion.h"

#include <type_traits>

namespace cimple {

// ---- The call ----

// One CMPI call in progress.
struct Call {
    CMPI_Adapter& adapter;
    const CMPIBroker* broker;
    const CMPIContext* context;

    // Calls the provider procedure with the provider object and these arguments.
    template <class... Args>
    sint32 provider(int operation, Args... args) const {
        return run(operation, {word(adapter.provider), word(args)...});
    }
    const Meta_Repository* repository() const;
    // The class of the path; null outside the repository.
    const Meta_Class* find_class(const CMPIObjectPath* path) const;
    Converter converter(const String& name_space) const;

private:
    template <class T>
    static Provider_Word word(T pointer) {
        static_assert(std::is_pointer_v<T>, "a word is an address");
        return reinterpret_cast<Provider_Word>(pointer);
    }
    sint32 run(int operation, const Provider_Word (&args)[8]) const;
};

// How a call ends. The object manager gets rc; the trace shows traced, and a text if there is one.
struct Answer {
    int rc;
    int traced;
    const char* text = nullptr;

    constexpr Answer(int code) : rc(code), traced(code) {}
    constexpr Answer(int code, const char* added) : rc(code), traced(code), text(added) {}
    constexpr Answer(int code, int shown) : rc(code), traced(shown) {}
};

enum class Locking { ADAPTER, NONE };

// Runs the body with a thread context pushed and the adapter's lock held; afterwards both are
// undone, whatever happens. An exception ends the call with CMPI_RC_ERR_FAILED: it would otherwise
// end a process that is not ours. A provider that is not loaded is CMPI_RC_ERR_INVALID_HANDLE.
CMPIStatus run_call(void* handle, const CMPIContext* context, const char* function, Locking locking,
                    Answer (*body)(const Call& call, void* closure), void* closure);

template <class Interface, class Body>
CMPIStatus run_call(Interface* interface, const CMPIContext* context, const char* function,
                    Body body, Locking locking = Locking::ADAPTER) {
    return run_call(
        interface ? interface->hdl : nullptr, context, function, locking,
        [](const Call& call, void* closure) {
            return Answer((*static_cast<Body*>(closure))(call));
        },
        &body);
}

// The last cleanup of an adapter unloads its provider. One for all four interfaces.
Answer cleanup_adapter(const Call& call, bool terminating);

template <class Interface>
CMPIStatus cleanup(Interface* interface, const CMPIContext* context, CMPIBoolean terminating) {
    return run_call(
        interface, context, "cleanup",
        [&](const Call& call) { return cleanup_adapter(call, terminating != 0); }, Locking::NONE);
}

// The functions of each interface; the name is filled in later.
extern const CMPIInstanceMIFT INSTANCE_FUNCTIONS;
extern const CMPIMethodMIFT METHOD_FUNCTIONS;
extern const CMPIAssociationMIFT ASSOCIATION_FUNCTIONS;
extern const CMPIIndicationMIFT INDICATION_FUNCTIONS;

// ---- Status ----

struct Status_Row {
    sint32 status;
    CMPIrc rc;
};

// The CMPI code of a provider's status. One that the table does not have is OK, 0 among them: that
// holds for unforeseen numbers as well, and is meant.
template <std::size_t N>
int map_status(const Status_Row (&table)[N], sint32 status) {
    for (const Status_Row& row : table)
        if (row.status == status)
            return row.rc;
    return CMPI_RC_OK;
}

// ---- Delivery ----

// Where the results of one call go.
struct Delivery {
    const Call& call;
    const CMPIResult* result;
    const char** properties; // null: all
    String name_space;       // of the request's path
    int error = CMPI_RC_OK;  // the first; nothing is forwarded after it
    End_Paths ends = {};     // what the delivered associations refer to
};

// Returns the path of the instance, or the instance, in this namespace. An error is kept; false
// then.
bool deliver_path(Delivery& delivery, const Instance* instance, const char* name_space);
bool deliver_instance(Delivery& delivery, const Instance* instance, const char* name_space);

// An instance handler for a delivery: takes over the instance and gives it to the function unless
// the stream has ended or an error is kept.
template <bool (*Deliver)(Delivery& delivery, const Instance* instance)>
bool delivery_handler(const Instance* instance, sint32, void* client_data) {
    const Ref<const Instance> owner(instance);
    Delivery& delivery = *static_cast<Delivery*>(client_data);
    if (!instance || delivery.error != CMPI_RC_OK)
        return false;
    return Deliver(delivery, instance);
}

} // namespace cimple

#endif // CIMPLE_CMPI_FRAME_H
