#include "schema/generator/cpp_text.h"
#include "schema/generator/generator.h"

#include <sstream>

namespace generator {

namespace {

std::string entries(const Catalogue& catalogue, Span span) {
    std::ostringstream out;
    out << BANNER << "#include \"registrations.h\"\n#include \"schema/entry_points.h\"\n\n";
    for (std::size_t i = span.begin; i < span.end; i++) {
        const mof::Schema_Class& each = *catalogue.providers[i];
        out << (each.is_association ? "VLN_ASSOCIATION_FACTORIES(" : "VLN_CLASS_FACTORIES(")
            << each.name() << ", " << i << ")\n";
    }
    return out.str();
}

std::string export_map(const Catalogue& catalogue) {
    std::ostringstream out;
    out << "{\nglobal:\n    cimple_module;\n";
    for (const mof::Schema_Class* each : catalogue.providers) {
        std::vector<const char*> kinds = {"Instance", "Method"};
        if (each->is_association)
            kinds.push_back("Association");
        for (const char* kind : kinds)
            for (const char* form : {"_Provider_Create_", "_Create_"})
                out << "    " << each->name() << form << kind << "MI;\n";
    }
    out << "local:\n    *;\n};\n";
    return out.str();
}

} // namespace

void write_entries(const Catalogue& catalogue, const Output& output, std::size_t parts) {
    for (std::size_t part = 0; part < parts; part++)
        output.write(part_name("entries", part, ".cpp"),
                     entries(catalogue, part_of(catalogue.providers.size(), part, parts)));
    output.write("export.map", export_map(catalogue));
}

} // namespace generator
