// Who serves which class, in the two forms that object managers read: a file of sections, and a
// MOF of instances. Both name the interop namespace as their kind of object manager spells it;
// where an administrator has chosen another, provider-register.sh puts that in its place.
#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <sstream>

namespace generator {

namespace {

// One group: all providers share one process, and so one picture of the adapters.
constexpr const char* GROUP = "vorlan_mpca";
constexpr const char* MODULE = "vorlan_mpca_provider"; // the file without "lib" and ".so" as well
constexpr const char* NAME_SPACE = "root/vorlan";
constexpr const char* SECTIONS_INTEROP = "root/pg_interop";
constexpr const char* INSTANCES_INTEROP = "root/PG_InterOp";

// Of PG_ProviderModule. A context that depends on who asks would mean a process for each user.
constexpr int PRIVILEGED_USER = 4;
// Of PG_ProviderCapabilities.
constexpr int INSTANCE = 2, ASSOCIATION = 3, METHOD = 5;

std::string sections(const Catalogue& catalogue) {
    std::ostringstream out;
    for (const mof::Schema_Class* each : catalogue.providers)
        out << "[" << each->name() << "]\n"
            << "   provider: " << each->name() << "_Provider\n"
            << "   location: " << MODULE << "\n"
            << "   type: instance method" << (each->is_association ? " association" : "") << "\n"
            << "   group: " << GROUP << "\n"
            << "   unload: never\n"
            << "   namespace: " << NAME_SPACE
            << (is_interop(catalogue, *each) ? std::string(" ") + SECTIONS_INTEROP : "") << "\n";
    return out.str();
}

std::string quoted(const std::string& text) {
    return "\"" + text + "\"";
}

// A provider's capabilities name it, and it names its module: the order is that of reading.
void put_provider(std::ostream& out, const Catalogue& catalogue,
                  const mof::Schema_Class& schema_class) {
    const std::string module = "    ProviderModuleName = " + quoted(MODULE) + ";\n";
    const std::string provider = quoted(schema_class.name() + "_Provider");
    const std::string name = quoted(schema_class.name());
    out << "\ninstance of PG_Provider\n{\n" << module << "    Name = " << provider << ";\n};\n";
    out << "\ninstance of PG_ProviderCapabilities\n{\n"
        << module << "    ProviderName = " << provider << ";\n"
        << "    CapabilityID = " << name << ";\n"
        << "    ClassName = " << name << ";\n"
        << "    Namespaces = {" << quoted(NAME_SPACE)
        << (is_interop(catalogue, schema_class) ? ", " + quoted(INSTANCES_INTEROP) : "") << "};\n"
        << "    ProviderType = {" << INSTANCE;
    if (schema_class.is_association)
        out << ", " << ASSOCIATION;
    out << ", " << METHOD << "};\n"
        << "    SupportedProperties = NULL;\n"
        << "    SupportedMethods = NULL;\n};\n";
}

std::string instances(const Catalogue& catalogue) {
    std::ostringstream out;
    out << "instance of PG_ProviderModule\n{\n"
        << "    Name = " << quoted(MODULE) << ";\n"
        << "    Vendor = \"Vorlan\";\n"
        << "    Version = " << quoted(VLN_VERSION) << ";\n"
        << "    InterfaceType = \"CMPI\";\n"
        << "    InterfaceVersion = \"2.0.0\";\n"
        << "    Location = " << quoted(MODULE) << ";\n"
        << "    UserContext = " << PRIVILEGED_USER << ";\n"
        << "    ModuleGroupName = " << quoted(GROUP) << ";\n};\n";
    for (const mof::Schema_Class* each : catalogue.providers)
        put_provider(out, catalogue, *each);
    return out.str();
}

} // namespace

void write_registrations(const Catalogue& catalogue, const Output& output) {
    output.write("vorlan_mpca_provider.reg", sections(catalogue));
    output.write("registration/provider_module.mof", instances(catalogue));
}

} // namespace generator
