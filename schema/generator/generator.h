// From the class catalogue to everything that is made of it: structures, constant tables, provider
// procedures, entry points, and what an object manager needs to know.
//
// The generator reads MOF and writes text; all judgement about a catalogue is passed in
// catalogue.cpp (faults are mof::Error), so the writers can rely on what they are given.
#ifndef SCHEMA_GENERATOR_GENERATOR_H
#define SCHEMA_GENERATOR_GENERATOR_H

#include "schema/mof_parser/mof.h"

#include <filesystem>

namespace generator {

// Into how many files the tables, the procedures and the factories are split, for parallel builds.
struct Parts {
    std::size_t meta = 12;
    std::size_t procs = 12;
    std::size_t entries = 2;
};

struct Catalogue {
    mof::Schema schema;
    std::vector<const mof::Schema_Class*> providers; // in the order of the registration chain
};

// Resolves the catalogue and refuses what C++ or the engine could not hold. Throws mof::Error.
Catalogue load_catalogue(const std::string& path);

// A folder of outputs. A file whose contents would stay the same is not touched, so that nothing is
// compiled anew without need. Throws std::runtime_error when a file cannot be written.
class Output {
public:
    explicit Output(std::filesystem::path folder) : _folder(std::move(folder)) {}
    void write(const std::string& name, const std::string& contents) const;

private:
    std::filesystem::path _folder;
};

// classes/<Class>.h for every class: the structure, and one for each method that it declares.
void write_classes(const Catalogue& catalogue, const Output& output);
// meta_records.h, meta_NN.cpp, meta_repository.h and .cpp: the constant tables.
void write_meta_tables(const Catalogue& catalogue, const Output& output, std::size_t parts);
// provider_types.h, provider_classes.inc, method_stubs.h, registrations.h, procs_NN.cpp and
// registration.cpp: what calls the providers.
void write_providers(const Catalogue& catalogue, const Output& output, std::size_t parts);
// entries_NN.cpp and export.map: what the object manager looks up.
void write_entries(const Catalogue& catalogue, const Output& output, std::size_t parts);
// mof/: the classes for the object managers' compilers, in layers.
void write_share(const Catalogue& catalogue, const Output& output);
// vorlan_mpca_provider.reg and registration/provider_module.mof: who serves which class.
void write_registrations(const Catalogue& catalogue, const Output& output);

// Whether a provided class is served in the interop namespace as well: profiles, and what joins
// them to elements and to one another. A client looks there first (DSP1033).
bool is_interop(const Catalogue& catalogue, const mof::Schema_Class& schema_class);

} // namespace generator

#endif // SCHEMA_GENERATOR_GENERATOR_H
