// The class catalogue's language.
#include "fuzz/fuzz.h"
#include "schema/mof_parser/word_map.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string text = fuzz::Input(data, size).rest();
    try {
        const mof::Schema schema(mof::parse_text(text, "input.mof"));
        for (const auto& schema_class : schema.classes()) {
            FUZZ_CHECK(schema.find(schema_class->name()) == schema_class.get());
            FUZZ_CHECK(schema_class->num_keys <= schema_class->features.size());
            for (const mof::Feature& feature : schema_class->declaration->features)
                if (const auto words = mof::Word_Map::read(feature))
                    FUZZ_CHECK(words->entries().empty() || words->find(words->entries()[0].low) ||
                               words->find(words->entries()[0].value));
        }
    } catch (const mof::Error& error) {
        // The place that an error names lies in the text.
        const auto lines = static_cast<std::size_t>(1 + std::count(text.begin(), text.end(), '\n'));
        FUZZ_CHECK(error.where().line >= 1 && error.where().line <= lines);
        FUZZ_CHECK(error.where().column >= 1 && error.where().column <= text.size() + 1);
    }
    return 0;
}
