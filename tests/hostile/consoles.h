// What consoles do with a host: requests of every kind, weighted as these make them, by one console
// or by many at once.
#ifndef TESTS_HOSTILE_CONSOLES_H
#define TESTS_HOSTILE_CONSOLES_H

#include "tests/hostile/changes.h"

#include <cstdint>
#include <map>
#include <random>
#include <set>
#include <shared_mutex>

namespace hostile {

inline constexpr std::uint64_t SECOND = 1000000;
inline constexpr std::uint64_t MORE_THAN_THE_CACHE = 11 * 60 * SECOND;

// How many requests are wanted: VLN_OPERATIONS in the environment, or what the suite has time for.
std::size_t wanted_operations();
bool tells_progress(); // if that is set

// The hosts that the table of changes knows, each with all of its changes.
std::vector<std::string> changed_hosts();

// By class the texts of all paths that the host shows.
using Names = std::map<std::string, std::set<std::string>>;
Names all_names(road::Road& road);

// Until no refresh is at work: this thread and that of the port status are left.
void wait_for_refresh();

// What consoles know of a host before they begin; used by all of them.
class Known_Host {
public:
    // The changes are those rows that the host has the instances for.
    Known_Host(road::Road& road, const std::vector<Change>& rows);

    host::Manager& manager;
    std::vector<std::string> classes, links;
    std::vector<host::ObjectPath> paths;
    std::vector<Prepared_Change> changes;

    // Held by a request to the class, or by a walk, which asks any association.
    std::shared_lock<std::shared_mutex> request(const std::string& class_name) {
        return std::shared_lock(_in_use.at(class_name));
    }
    std::shared_lock<std::shared_mutex> walk() { return std::shared_lock(_walked); }
    // Unloads the provider of a class that is idle, as object managers do; false if it is not.
    bool unload(const std::string& class_name);

private:
    std::map<std::string, std::shared_mutex> _in_use;
    std::shared_mutex _walked;
};

// One console. What it may be answered depends on what others do, so only the object manager's
// checks of the provider judge the answers.
class Console {
public:
    Console(Known_Host& host, std::mt19937& random) : _host(host), _random(random) {}

    void make_request();
    std::size_t unloads() const { return _unloads; }

private:
    struct Kind {
        unsigned weight; // of a hundred
        void (Console::*make)();
    };
    static const Kind KINDS[10];

    template <class List>
    auto& any(List& list) {
        return list[std::uniform_int_distribution<std::size_t>(0, list.size() - 1)(_random)];
    }

    void enumerate();
    void list_names();
    void get();
    void get_some();
    void walk_names();
    void walk_all_names();
    void walk_all();
    void change();
    void let_time_pass();
    void unload();

    Known_Host& _host;
    std::mt19937& _random;
    std::size_t _unloads = 0;
};

} // namespace hostile

#endif // TESTS_HOSTILE_CONSOLES_H
