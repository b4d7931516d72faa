// vln_generator CATALOGUE.mof OUTPUT-FOLDER SHARE-FOLDER META-FILES PROC-FILES ENTRY-FILES
// vln_generator --check CATALOGUE.mof
//
// The second form writes nothing: a build checks first, so that a fault is not buried under the
// names of everything that could not be made.
//
// Exit status: 0 done, 1 a fault of the catalogue or of the file system (one line on standard
// error, "file:line:column: what is wrong" for the catalogue), 2 wrong usage.
#include "schema/generator/generator.h"

#include <charconv>
#include <cstdio>
#include <cstring>

namespace {

constexpr std::size_t MAX_PARTS = 99;

bool number(const char* text, std::size_t& value) {
    const char* end = text + std::strlen(text);
    auto [stop, fault] = std::from_chars(text, end, value);
    return fault == std::errc() && stop == end && value >= 1 && value <= MAX_PARTS;
}

generator::Catalogue load(const char* source) {
    generator::Catalogue catalogue = generator::load_catalogue(source);
    if (catalogue.providers.empty())
        throw std::runtime_error(std::string(source) + ":1:1: no class to provide");
    return catalogue;
}

void generate(const char* source, const char* folder, const char* share,
              const generator::Parts& parts) {
    const generator::Catalogue catalogue = load(source);
    const generator::Output output(folder);
    generator::write_classes(catalogue, output);
    generator::write_meta_tables(catalogue, output, parts.meta);
    generator::write_providers(catalogue, output, parts.procs);
    generator::write_entries(catalogue, output, parts.entries);
    generator::write_share(catalogue, generator::Output(share));
    generator::write_registrations(catalogue, generator::Output(share));
}

} // namespace

int main(int argc, char** argv) {
    generator::Parts parts;
    const bool check = argc == 3 && std::strcmp(argv[1], "--check") == 0;
    if (!check && (argc != 7 || !number(argv[4], parts.meta) || !number(argv[5], parts.procs) ||
                   !number(argv[6], parts.entries))) {
        std::fputs("usage: vln_generator CATALOGUE.mof OUTPUT-FOLDER SHARE-FOLDER"
                   " META-FILES PROC-FILES ENTRY-FILES\n"
                   "       vln_generator --check CATALOGUE.mof\n",
                   stderr);
        return 2;
    }
    try {
        if (check)
            load(argv[2]);
        else
            generate(argv[1], argv[2], argv[3], parts);
        return 0;
    } catch (const std::exception& fault) {
        std::fprintf(stderr, "%s\n", fault.what());
        return 1;
    }
}
