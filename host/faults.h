// What a provider did wrong, as the object manager saw it.
//
// A fault is something that a real object manager would refuse, trip over, or silently lose memory
// by. The list may be used by any thread; it keeps the first thousand and counts the rest.
#ifndef HOST_FAULTS_H
#define HOST_FAULTS_H

#include <cstddef>
#include <mutex>
#include <string>
#include <vector>

namespace host {

enum class FaultKind {
    unknown_class,    // an object of a class that the schema does not have
    unknown_property, // a property or key that the class does not have
    type_mismatch,    // a value of another type than declared, or a reference to another class
    bad_path,         // an object path with a missing or unknown key where a complete one is needed
    bad_text,         // bytes that are no UTF-8
    bad_argument,     // a null, a size or a code that no caller may give
    wrong_result,     // a result of the wrong kind or class, or after returnDone
    bad_output,       // an output that the method does not have, or of another type
    double_release,   // release of an object that was released before
    use_after_release,  // use of an object that was released, or that went with its call
    foreign_object,     // a pointer to something that the object manager never made, or overwrote
    released_parameter, // release of a parameter of the call
    stale_element,      // an element of an array was released before the array was used
    unattached_thread,  // a call from a thread that was not attached
    attachment,         // attachThread and detachThread that do not match
    left_at_detach,     // objects of a thread that it had not released when it detached
    dead_broker,        // a call through the broker of a provider that was cleaned up
    recursion,          // an up-call that leads back into the provider that makes it
    leak,               // an object still alive after everything was cleaned up
    interface,          // a factory or function table that is not as the interface demands
};
const char* to_string(FaultKind kind);

struct Fault {
    FaultKind kind;
    std::string class_name; // of the provider that was running; empty: none
    std::string operation;  // that it was running; empty: none
    std::string text;
};
// "VLNMPCA_Card enumerateInstances: type mismatch: Tag: string expected, got uint16"
std::string to_string(const Fault& fault);

class FaultList {
public:
    void add(Fault fault);
    std::vector<Fault> all() const;
    std::size_t count() const;
    std::size_t count(FaultKind kind) const;
    void clear();

private:
    static constexpr std::size_t kept = 1000;
    mutable std::mutex _mutex; // guards both
    std::vector<Fault> _faults;
    std::size_t _total = 0;
};

} // namespace host

#endif // HOST_FAULTS_H
