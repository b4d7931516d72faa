// What ValueMap and Values say together: which word stands for which value of a property, a
// parameter or a method's result. BitMap and BitValues say the same of bits.
#ifndef SCHEMA_MOF_PARSER_WORD_MAP_H
#define SCHEMA_MOF_PARSER_WORD_MAP_H

#include "schema/mof_parser/mof.h"

namespace mof {

class Word_Map {
public:
    // Takes an entry as DSP0004 has it: a value, "low..high", "low..", "..high", or ".." for what
    // no other entry claims. Numbers may be written as everywhere in MOF. Null where the
    // declaration has neither qualifier. Throws Error, at the qualifier, when it has one alone,
    // when their lengths differ, when an entry does not fit the type, or claims what an earlier one
    // has.
    static std::optional<Word_Map> read(const Declaration& declaration);
    // The same of a pair of qualifiers, wherever they come from.
    static std::optional<Word_Map> read(const Qualifier* map, const Qualifier* words, Type type);

    // Null: the map does not know the value. A number past sint64 is taken for its largest.
    const std::string* find(std::int64_t value) const;
    const std::string* find(std::string_view value) const;

    struct Entry {
        std::string value; // as written
        std::string word;
        std::int64_t low = 0, high = 0; // of a number
        bool rest = false;              // ".."
    };
    const std::vector<Entry>& entries() const { return _entries; }

private:
    const std::string* rest() const;

    std::vector<Entry> _entries;
};

} // namespace mof

#endif // SCHEMA_MOF_PARSER_WORD_MAP_H
