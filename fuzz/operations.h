// How the bytes of an input become operations on the module's entry points.
//
// An operation is a byte for its kind, two for its class or method, and what each of its parts
// takes: mostly a byte that says how a part is made, and then a number of one of what the host has.
// So short inputs are sensible operations, and any change of a byte changes one part alone. Paths,
// property values and arguments are mostly taken from the instances that the host has and from the
// calls of tests/hostile/changes.tsv, which all succeed; some are broken, of another type or null.
//
// Nothing here is checked before it goes to the provider, unlike what goes through a manager.
#ifndef FUZZ_OPERATIONS_H
#define FUZZ_OPERATIONS_H

#include "fuzz/fuzz.h"
#include "fuzz/simulated_host.h"

#include <map>

namespace fuzz {

class Operations {
public:
    // Those of the process, over everything.json, made at the first call.
    static Operations& instance();

    explicit Operations(Simulated_Host& host);
    Simulated_Host& host() { return _host; }

    // Makes those that the input tells, as many as that; at most one refresh.
    void make(Input& input, unsigned count);

private:
    struct Method {
        const host::Class* known;
        const host::Method* method;
    };
    // A call that succeeds.
    struct Change {
        char kind; // '+' create, '-' delete, '=' modify, '.' invoke
        std::string method;
        host::Instance instance;
        host::Named_Values values;
    };

    void read_changes();
    void read_change(const std::string& line);
    std::string filled_in(const std::string& text) const;
    const host::Instance* find(const std::string& class_and_number) const;
    void collect(const host::Instance& instance);

    void make_one(Input& input);
    void make_change(Input& input);
    void ask_instances(Input& input, unsigned kind);
    void ask_associations(Input& input, unsigned kind);
    void modify(Input& input, bool create);
    void invoke(Input& input);
    void invoke(const host::ObjectPath& path, const std::string& method,
                const host::Named_Values& inputs);
    void modify(const host::Instance& instance, const host::Property_List& properties);
    void create(const host::Instance& instance);
    void remove(const host::ObjectPath& path);

    const Stocked_Class& any_class(Input& input) const;
    const host::Instance* any_instance(Input& input) const;
    host::ObjectPath any_path(Input& input, const Stocked_Class& stocked);
    host::Property_List any_properties(Input& input, const host::Class& known) const;
    std::string any_text(Input& input) const;
    host::Value any_value(Input& input, const host::Slot_Type& slot, const std::string& name);
    host::Value plain_value(Input& input, CMPIType type, bool embedded);
    void spoil(Input& input, host::Named_Values& values, const host::Class* known,
               const host::Method* method);
    void say(const char* what, const std::string& where) const;

    Simulated_Host& _host;
    std::vector<Method> _methods;
    std::vector<const host::Class*> _associations;
    std::vector<Change> _changes;
    std::map<std::string, std::vector<host::Value>> _values; // by the name of their slot
    std::vector<std::string> _texts;
    bool _refreshed = false;
    unsigned _depth = 0;                                        // of values in values
    const bool _loud = std::getenv("VLN_FUZZ_LOUD") != nullptr; // each operation is told
};

} // namespace fuzz

#endif // FUZZ_OPERATIONS_H
