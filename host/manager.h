// An in-process object manager: loads a CMPI provider module and asks it, as a demanding one would.
//
// It knows the classes from MOF, hands the provider only what the interface promises, checks
// everything that comes back, frees what a call leaves behind, and keeps a list of the provider's
// faults. Up-calls are answered from platform instances and, for classes of the module itself, by
// the providers. Any number of threads may use a manager at once, also while a module is in a long
// call; load and close are called by one thread, with no call running.
#ifndef HOST_MANAGER_H
#define HOST_MANAGER_H

#include "host/class_repository.h"
#include "host/faults.h"
#include "host/object_store.h"
#include "host/path_text.h"
#include "host/value.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

namespace host {

struct Options {
    std::string mof_path;          // "": the catalogue of the build or installation
    std::string platform_path;     // instances for up-calls; "": none
    std::string registration_path; // who is asked what where; "": the module's classes, everywhere
    std::string name_space = "root/vorlan";
    // Where, beside name_space, up-calls reach the providers of a module without a registration.
    std::vector<std::string> more_name_spaces = {"root/pg_interop"};
    std::string principal = "root";
    // Released texts are overwritten and kept for a while, so that a late use is seen, and
    // harmless. Off, there are no class defaults and no limit to answers either: what is measured
    // then is the provider.
    bool strict = true;
    // Good elements of an enumeration come with the state CMPI_nullValue, as from one object
    // manager.
    bool elements_marked_null = false;
    // Properties that a provider left null come with the default that their class gives them.
    bool class_defaults = true;
    // Bytes that an answer to a client may have as CIM-XML; 0: any number.
    std::size_t answer_limit = 10'000'000;
    // Microseconds since the epoch, for new datetimes; empty: the system's clock.
    std::function<std::uint64_t()> clock;
    // Asked at each call from the provider to its broker or to an object, and at each up-call, on
    // the thread that makes it. True: the call does nothing and answers null, with the status in
    // code, CMPI_RC_OK included; a call of an object fails with its own.
    std::function<bool(bool is_up_call, const char* function, CMPIrc& code)> refuse;
    // Gets a line for each call into the provider and each up-call, on the thread that makes it.
    std::function<void(const std::string&)> trace;
};

// A file that cannot be used; what() is "file:line: what is wrong" or the like.
class Setup_Error : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

template <class T>
struct Reply {
    Status status;
    T value{};
    bool ok() const { return status.ok(); }
};

// Nothing: all properties.
using Property_List = std::optional<std::vector<std::string>>;

// Empty texts: no restriction. Without via, every association class of the module that can have the
// instance at an end is asked, in the order of the catalogue; a base class stands for its
// subclasses.
struct Association_Filter {
    std::string via;
    std::string result_class;
    std::string role;
    std::string result_role;
};

struct Method_Result {
    Value value; // null when the method gave none
    Named_Values outputs;
};

struct Indication {
    std::string name_space;
    Instance instance;
};

struct Log_Message {
    int severity; // a CMPISeverity, or 0 for a trace line
    std::string id;
    std::string text;
};

struct Statistics {
    std::size_t calls = 0;           // into the module
    std::size_t up_calls = 0;        // from it
    std::size_t objects_created = 0; // CMPI objects
    std::size_t objects_left = 0; // of these, freed by the end of their call, parameters included
    std::size_t objects_peak = 0; // the most alive at once
    std::size_t answer_peak = 0;  // bytes of the largest answer, as CIM-XML, if there is a limit
};

class Manager {
public:
    // Reads the classes and the platform. Throws Setup_Error.
    explicit Manager(Options options = {});
    ~Manager(); // as close()
    Manager(const Manager&) = delete;
    Manager& operator=(const Manager&) = delete;

    // Opens a module; its providers are made at the first call for their class. One at a time.
    Status load(const std::string& module_path);
    // Calls cleanup for every interface that was made. Terminating or not, a provider that agrees
    // is made anew at its next call. Answers the first code that is not OK.
    Status cleanup(bool terminating);
    // The same for the provider of one class.
    Status cleanup(const std::string& class_name, bool terminating);
    // Unloads the module as it stands: what a hasty object manager does.
    void abandon();
    // Cleans up, unloads the module, records what is still alive as leaks and frees it.
    void close();

    const Options& options() const;
    const ClassRepository& classes() const;
    // The classes that the module has a provider for, in the order of the catalogue.
    std::vector<const Class*> provider_classes() const;
    bool serves(const Class& known) const;
    // As registered; for an association class, also to be walked.
    bool serves(const Class& known, const std::string& name_space) const;
    // Text as `path_to_text` writes it; a path without a namespace is in options().name_space.
    Parsed_Path parse_path(std::string_view text) const;

    // An empty namespace stands for options().name_space. A class without a provider is served from
    // the platform. An unknown class is CMPI_RC_ERR_INVALID_CLASS, and so is one that nobody serves
    // there once there is a registration; nothing of that reaches a provider.
    // An answer beyond options().answer_limit is refused with CMPI_RC_ERR_FAILED.
    Reply<std::vector<Instance>> enumerate(const std::string& class_name,
                                           const Property_List& properties = std::nullopt,
                                           const std::string& name_space = "");
    Reply<std::vector<ObjectPath>> enumerate_names(const std::string& class_name,
                                                   const std::string& name_space = "");
    Reply<Instance> get(const ObjectPath& path, const Property_List& properties = std::nullopt);
    // The instance's path may lack keys. Answers the path that the provider gave the new instance.
    Reply<ObjectPath> create(const Instance& instance);
    Status modify(const Instance& instance, const Property_List& properties = std::nullopt);
    Status remove(const ObjectPath& path);

    Reply<std::vector<Instance>> associators(const ObjectPath& path,
                                             const Association_Filter& filter = {},
                                             const Property_List& properties = std::nullopt);
    Reply<std::vector<ObjectPath>> associator_names(const ObjectPath& path,
                                                    const Association_Filter& filter = {});
    // Of the filter, via and role count.
    Reply<std::vector<Instance>> references(const ObjectPath& path,
                                            const Association_Filter& filter = {},
                                            const Property_List& properties = std::nullopt);
    Reply<std::vector<ObjectPath>> reference_names(const ObjectPath& path,
                                                   const Association_Filter& filter = {});

    // A method without the qualifier Static needs a complete path. Inputs are checked by the
    // method.
    Reply<Method_Result> invoke(const ObjectPath& path, const std::string& method,
                                const Named_Values& inputs);

    std::vector<Fault> faults() const;
    std::size_t fault_count() const; // also those beyond the list
    void clear_faults();
    Live_Counts live_objects() const; // by kind, now
    std::size_t live_object_count() const;
    Statistics statistics() const;
    void restart_peak(); // from what is alive now, and from no answer
    std::vector<Indication> indications() const;
    std::vector<Log_Message> log_messages() const;

private:
    std::shared_ptr<Core> _core;
};

} // namespace host

#endif // HOST_MANAGER_H
