// What the built module makes of every method and of every change of an instance: a provider whose
// override is misspelt, or takes other arguments, leaves the class with the refusal of the pattern.
#include "tests/road/road.h"

#include <cstdlib>
#include <fstream>

using road::Road;

namespace {

// Of a call without arguments, which no implementation takes for something to do. The pattern
// refuses a method with INVOKE_METHOD_UNSUPPORTED, 131.
const char* word(const host::Status& status) {
    return status.rc == CMPI_RC_ERR_NOT_SUPPORTED ? "refused" : "implemented";
}

// A key of any value, so that the object manager hands the call on.
host::Value some_value(const host::Property& key) {
    if (key.type == CMPI_dateTime)
        return host::Value::datetime("20200102030405.000000+000");
    return host::is_unsigned(key.type) ? host::Value::unsigned_number(key.type, 1)
                                       : host::Value::text("none");
}

host::ObjectPath path_of(const host::Class& known) {
    host::ObjectPath path;
    path.class_name = known.name;
    for (const std::size_t key : known.keys)
        path.keys.push_back({known.properties[key].name, some_value(known.properties[key])});
    return path;
}

TEST(Methods, AreImplementedOrRefusedAsAgreed) {
    Road road;
    std::ofstream found("methods.tsv");
    for (const host::Class* known : road.manager().provider_classes()) {
        if (known->is_association)
            continue;
        host::Instance instance;
        instance.path = path_of(*known);
        for (const host::Method& method : known->methods) {
            const auto reply = road.manager().invoke(instance.path, method.name, {});
            found << known->name << '.' << method.name << '\t' << word(reply.status) << '\n';
            const bool coded = method.result.meaning && method.result.meaning->words;
            EXPECT_TRUE(!coded || !reply.ok() ||
                        host::word_of(method.result, reply.value.value).has_value())
                << known->name << '.' << method.name << ": no word for what it returns";
        }
        found << known->name << "\tcreate " << word(road.manager().create(instance).status)
              << ", modify " << word(road.manager().modify(instance)) << ", delete "
              << word(road.manager().remove(instance.path)) << '\n';
    }
    found.close();
    EXPECT_EQ(std::system("diff -u '" VLN_METHODS "' methods.tsv"), 0)
        << "if it is meant: cp build/lp64/tests/run/test_services/methods.tsv tests/services/";
}

} // namespace
