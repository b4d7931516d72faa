// The files under tables/: what clients do to a host, and what comes of it, a row each.
#ifndef TESTS_SERVICES_TABLE_TEXT_H
#define TESTS_SERVICES_TABLE_TEXT_H

#include <ostream>
#include <string>
#include <vector>

namespace services {

// VERB WORD... -> EXPECTED... | LINE | LINE
struct Row {
    std::string place; // "file:number"
    std::string verb;
    std::vector<std::string> words;
    bool is_answered = false; // something stands behind an arrow:
    std::vector<std::string> answer;
    std::vector<std::string> lines;
};

struct Table {
    std::string name; // "file_test"
    std::string host; // a file of the scenarios, or a JSON text
    std::vector<Row> rows;

    friend void PrintTo(const Table& table, std::ostream* out) { *out << table.name; }
};

// All of the folder, in the order of their names.
//
// A line is a row; one that begins with a blank goes on with the row before it, and "#" begins a
// remark. Blanks separate words, but within double quotes, which are left out unless "\" stands
// before them. "host" and what follows it is the host of the tests from there on: a scenario, or a
// JSON text, where $SCENARIOS is their folder. "test NAME" begins a test. "let NAME TEXT" has $NAME
// stand for the text, to the end of the file. {TEXT*3} is the text three times, \xE4 a byte.
std::vector<Table> read_tables(const std::string& folder);

} // namespace services

#endif // TESTS_SERVICES_TABLE_TEXT_H
