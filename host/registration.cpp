#include "host/registration.h"

#include "host/manager.h"

#include <algorithm>
#include <iterator>
#include <sstream>

namespace host {

namespace {

constexpr Interface INTERFACES[] = {Interface::instance, Interface::association, Interface::method};

// Object managers whose interop namespace is the one of today take the older name for it.
std::string_view settled(std::string_view name_space) {
    return same_name(name_space, "root/pg_interop") ? "root/interop" : name_space;
}

bool contains(const std::vector<std::string>& name_spaces, std::string_view wanted) {
    return std::any_of(name_spaces.begin(), name_spaces.end(), [&](const std::string& each) {
        return same_name(settled(each), settled(wanted));
    });
}

unsigned bit(Interface kind) {
    return static_cast<unsigned>(kind);
}

} // namespace

const char* to_string(Interface kind) {
    return kind == Interface::instance      ? "instance"
           : kind == Interface::association ? "association"
                                            : "method";
}

// As strict as the object managers whose form this is: what they would misread is refused.
struct Registration::Reader {
    Registration& into;
    const std::string& path;
    std::size_t number = 0;
    std::string name = {}; // of the section
    Entry entry = {};

    [[noreturn]] void fail(const std::string& text) const {
        throw Setup_Error(path + ":" + std::to_string(number) + ": " + text);
    }

    void start_section(const std::string& class_name) {
        finish_section();
        name = class_name;
        entry = {};
    }

    void take(const std::string& word, const std::vector<std::string>& values) {
        if (word == "namespace:")
            entry.name_spaces = values;
        else if (word == "group:" && !values.empty())
            entry.group = values.front();
        else if (word == "type:")
            for (const std::string& value : values)
                entry.kinds |= kind(value);
    }

    unsigned kind(const std::string& word) const {
        for (const Interface each : INTERFACES)
            if (word == to_string(each))
                return bit(each);
        fail("unknown type " + word + "; known here are instance, association or method");
    }

    void finish_section() {
        if (name.empty())
            return;
        if (!entry.kinds || entry.name_spaces.empty())
            fail("[" + name + "] has no " + (entry.kinds ? "namespace" : "type"));
        if (into.has(name))
            fail("a second section [" + name + "]");
        // Without a group a provider gets a process of its own. This object manager has one.
        if (entry.group.empty())
            entry.group = name;
        if (const auto other = into._entries.begin();
            other != into._entries.end() && other->second.group != entry.group)
            fail("[" + name + "] and [" + other->first + "] are in different groups: each would " +
                 "run in a process of its own, and share nothing");
        for (const std::string& name_space : entry.name_spaces)
            if (!contains(into._all, name_space))
                into._all.push_back(name_space);
        into._entries.emplace(name, entry);
    }
};

void Registration::read(const std::string& path) {
    const auto text = mof::read_file(path);
    if (!text)
        throw Setup_Error(path + ": cannot be read");
    Reader reader{*this, path};
    std::istringstream lines(*text);
    for (std::string line, word; std::getline(lines, line);) {
        ++reader.number;
        std::istringstream words(line);
        if (!(words >> word))
            continue;
        if (line.back() == ' ')
            reader.fail("a blank at the end of the line");
        if (word.starts_with('[') && word.ends_with(']')) {
            reader.start_section(word.substr(1, word.size() - 2));
            continue;
        }
        if (reader.name.empty() || !word.ends_with(':'))
            reader.fail("\"[Class]\" or \"word: value\" expected");
        using Words = std::istream_iterator<std::string>;
        reader.take(word, std::vector<std::string>(Words(words), Words()));
    }
    reader.finish_section();
}

bool Registration::has_name_space(std::string_view name_space) const {
    return contains(_all, name_space);
}

Status Registration::unknown_name_space(std::string_view name_space) const {
    return {CMPI_RC_ERR_INVALID_NAMESPACE, "nothing is registered in namespace " +
                                               std::string(name_space) +
                                               did_you_mean(name_space, _all)};
}

Status Registration::check(std::string_view class_name, Interface kind,
                           std::string_view name_space) const {
    if (is_empty())
        return {};
    if (!has_name_space(name_space))
        return unknown_name_space(name_space);
    const auto found = _entries.find(class_name);
    if (found == _entries.end())
        return class_not_found(class_name, name_space);
    const Entry& entry = found->second;
    if (!contains(entry.name_spaces, name_space)) {
        Status status = class_not_found(class_name, name_space);
        status.message += " but in " + join_or(entry.name_spaces);
        return status;
    }
    if (entry.kinds & bit(kind))
        return {};
    return {kind == Interface::method ? CMPI_RC_ERR_METHOD_NOT_AVAILABLE
                                      : CMPI_RC_ERR_NOT_SUPPORTED,
            std::string(class_name) + " has no " + to_string(kind) + " provider in " +
                std::string(name_space)};
}

Status class_not_found(std::string_view class_name, std::string_view name_space) {
    return {CMPI_RC_ERR_INVALID_CLASS, "class not found: nobody serves " + std::string(class_name) +
                                           " in " + std::string(name_space)};
}

} // namespace host
