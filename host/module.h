// A provider module: the shared library, and the interfaces that its factories made.
//
// A factory is called once for each kind of interface and class, at the first use of it. Any thread
// may ask for interfaces; open and close are called by one thread, with no call running.
#ifndef HOST_MODULE_H
#define HOST_MODULE_H

#include "host/class_repository.h"

#include <atomic>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>
#include <vector>

namespace host {

class Core;
struct ProviderBroker;

// The interfaces of one class; each is null until its factory was called, and when there is none.
struct Provider {
    std::mutex mutex; // guards all below; held while a factory or a cleanup runs
    CMPIInstanceMI* instance = nullptr;
    CMPIAssociationMI* association = nullptr;
    CMPIMethodMI* method = nullptr;
    ProviderBroker* broker = nullptr; // for as long as any of these is there
    // While a cleanup runs, requests are refused: one that comes of an up-call would wait for a
    // cleanup that waits for the up-call.
    std::atomic<bool> is_leaving{false};
};

class Module {
public:
    Module() = default;
    ~Module();
    Module(const Module&) = delete;
    Module& operator=(const Module&) = delete;

    // Says what is wrong, or nothing.
    std::string open(const std::string& path, const ClassRepository& classes);
    bool is_open() const { return _library != nullptr; }
    // Clean up first: what is left makes calls that nobody answers any more.
    void close();

    // Whether the module exports a factory for the class.
    bool serves(const Class& known) const { return _served.contains(&known); }
    bool serves_association(const Class& known) const { return _associations.contains(&known); }

    // An interface of the class, made now if need be. Null with a status if that fails.
    CMPIInstanceMI* instance(Core& core, const Class& known, Status& status);
    CMPIAssociationMI* association(Core& core, const Class& known, Status& status);
    CMPIMethodMI* method(Core& core, const Class& known, Status& status);

    // Calls cleanup of every interface, of one class or of all if null; those that agree are
    // forgotten. The first code that is not OK.
    Status cleanup(Core& core, bool terminating, const Class* only = nullptr);

private:
    void* symbol(const Class& known, const char* kind) const;
    Provider& provider(const Class& known);
    template <class MI>
    MI* interface(Core& core, const Class& known, MI* Provider::*member, const char* kind,
                  Status& status);
    template <class MI>
    void cleanup_one(Core& core, const Class& known, Provider& provider, MI* Provider::*member,
                     bool terminating, Status& first);

    void* _library = nullptr;
    std::unordered_set<const Class*> _served; // these two change in open and close only
    std::unordered_set<const Class*> _associations;
    std::mutex _mutex; // guards the map, not what is in it
    std::map<const Class*, std::unique_ptr<Provider>> _providers;
};

} // namespace host

#endif // HOST_MODULE_H
