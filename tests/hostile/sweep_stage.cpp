// What happens in one process: the points of an operation, and the lives that they run in.
#include "tests/hostile/sweep.h"

#include "host/core.h"
#include "tests/road/hosts.h"

#include <algorithm>
#include <fstream>
#include <sstream>

#include <dlfcn.h>

namespace sweep {

namespace {

namespace fs = std::filesystem;

// Points of one kind and operation in the suite's sample.
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
constexpr std::array<std::size_t, KINDS> SAMPLES = {2, 2, 1, 1, 1, 1, 1, 2, 1}; // a life is long
#else
constexpr std::array<std::size_t, KINDS> SAMPLES = {8, 5, 2, 2, 2, 2, 2, 4, 2};
#endif

// They wait for the first pass, start the status thread, and wait for the pass over the SAN.
constexpr const char* FIRST_CLASSES[] = {"VLNMPCA_Card", "VLNMPCA_EthernetPort",
                                         "VLNMPCA_StorageVolume"};

constexpr std::uint64_t TOO_SMALL = ~0ull; // beside the statuses

using Statuses = std::vector<std::uint64_t>;

// What a function may answer, by statuses.tsv: those of any function and its own, or after "=" its
// own alone.
Statuses statuses_of(const std::string& function) {
    static const auto& rows = *new auto([] {
        std::map<std::string, Statuses> table;
        std::ifstream file(VLN_STATUSES);
        for (std::string line; std::getline(file, line);) {
            std::istringstream fields(line.substr(0, line.find('#')));
            std::string name, status;
            fields >> name;
            if (name.empty())
                continue;
            Statuses& row = table[name] = table["*"];
            while (fields >> status)
                if (status == "=")
                    row.clear();
                else
                    row.push_back(status == "small" ? TOO_SMALL : std::stoul(status));
        }
        return table;
    }());
    const auto row = rows.find(function);
    return row == rows.end() ? rows.at("*") : row->second;
}

std::uint64_t scattered(std::string_view text, std::uint64_t seed) {
    std::uint64_t hash = 14695981039346656037ull ^ seed;
    for (const char c : text)
        hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211ull;
    return hash ^ (hash >> 29);
}

std::size_t entries(const char* folder) {
    return static_cast<std::size_t>(
        std::distance(fs::directory_iterator(folder), fs::directory_iterator()));
}

// What a thread leaves at its very end may stand for a moment more.
template <class Count>
std::size_t settled(std::size_t expected, Count count) {
    for (int i = 0; i < 1000 && count() > expected; ++i)
        usleep(1000);
    return count();
}

std::string open_files() {
    std::string text;
    for (const auto& file : fs::directory_iterator("/proc/self/fd")) {
        std::error_code gone; // as the list itself
        text += file.path().filename().string() + " " +
                fs::read_symlink(file.path(), gone).string() + "\n";
    }
    return text;
}

// After these the product uses the HBA API although it cannot be used, and that is meant: nobody
// looks whether it could be loaded, and an absent open answers the handle 1. Its other calls fail,
// as do those into a library that is not initialised for want of the semaphore.
bool goes_on_blindly(const Point& point) {
    return point.kind == LINKER || point.kind == OPEN || point.function == "HBA_LoadLibrary" ||
           (point.function == "HBA_OpenAdapter" && point.fault == VLNSIM_ABSENT);
}

std::vector<Point> points_of_calls(const std::vector<std::string>& lines) {
    std::vector<Point> points;
    std::map<std::string, unsigned> calls;
    std::set<std::uint64_t> identifiers;
    for (const std::string& line : lines) {
        Point point{
            .kind = CALL, .number = 0, .function = line.substr(0, line.find('(')), .line = line};
        point.call = ++calls[point.function];
        if (point.call == 1) {
            point.fault = VLNSIM_ABSENT;
            points.push_back(point);
        }
        if (point.function == "AX_GetAttributeValue") {
            point.fault = VLNSIM_MISSING;
            points.push_back(point);
            // And everywhere: the identifier is the first argument.
            const std::uint64_t identifier = std::stoul(line.substr(line.find('(') + 1));
            if (identifiers.insert(identifier).second) {
                points.push_back(point);
                points.back().call = VLNSIM_EVERY;
                points.back().value = identifier;
            }
        }
        for (const std::uint64_t status : statuses_of(point.function)) {
            point.fault = status == TOO_SMALL ? VLNSIM_TOO_SMALL : VLNSIM_STATUS;
            point.value = status == TOO_SMALL ? 0 : status;
            points.push_back(point);
        }
    }
    return points;
}

std::vector<Point> points_of_events(Kind kind, unsigned long count) {
    std::vector<Point> points;
    for (unsigned long number = 1; number <= count; ++number) {
        points.push_back({.kind = kind, .number = number});
        if (kind == BROKER || kind == UP_CALL)
            points.push_back({.kind = kind, .number = number, .code = CMPI_RC_OK});
    }
    return points;
}

// Spread evenly, from a place that name and seed give.
std::vector<Point> chosen(std::vector<Point> points, const Choice& choice,
                          const Operation& operation, Kind kind) {
    if (!choice.text.empty()) {
        std::erase_if(points, [&](const Point& one) { return one.text() != choice.text; });
        return points;
    }
    const std::size_t most = std::min(choice.most ? choice.most : SAMPLES[kind], operation.most);
    if (points.size() <= most)
        return points;
    const std::size_t step = points.size() / most;
    auto at =
        static_cast<std::size_t>(scattered(operation.name + kind_name(kind), choice.seed) % step);
    std::vector<Point> some;
    for (; some.size() < most; at += step)
        some.push_back(std::move(points[at]));
    return some;
}

std::size_t given(const host::Instance& instance) {
    return static_cast<std::size_t>(
        std::count_if(instance.properties.begin(), instance.properties.end(),
                      [](const host::Named_Value& one) { return !one.value.is_null(); }));
}

} // namespace

const char* kind_name(Kind kind) {
    constexpr const char* NAMES[] = {"call", "allocation", "thread", "linker", "open",
                                     "read", "write",      "broker", "up-call"};
    return NAMES[kind];
}

Events& events_of_module() {
    void* module = dlopen(VLN_MODULE, RTLD_LAZY | RTLD_NOLOAD);
    void* hook = module ? dlsym(module, "module_events") : nullptr;
    if (!hook)
        throw std::runtime_error("the module is not the one that counts its events");
    dlclose(module);
    return *reinterpret_cast<decltype(module_events)*>(hook)();
}

std::string Point::text() const {
    if (kind != CALL)
        return kind_name(kind) + (" " + std::to_string(number)) +
               (code == CMPI_RC_OK ? " without a status" : "");
    constexpr const char* FAULTS[] = {"status", "", "too small", "missing", "absent"};
    return function + " call " + std::to_string(call) + " " + FAULTS[fault] +
           (fault == VLNSIM_STATUS || value ? " " + std::to_string(value) : "");
}

Stage::Stage(const std::string& scenario, bool log)
    : _road({.scenario = scenario,
             .platform = road::PLATFORM, // what up-calls find
             .log = log,
             .refuse = [this](bool is_up_call, const char* function, CMPIrc& code) {
                 return refuses(is_up_call, function, code);
             }}) {
    _events = &events_of_module();
    // What is made once for the process.
    begin_life();
    _whole = look();
    end_life();
    fs::remove_all(saved_settings());
    fs::copy(_road.root() / "etc", saved_settings(), fs::copy_options::recursive);
    _threads = entries("/proc/self/task");
    _descriptors = entries("/proc/self/fd");
    begin_life();
    EXPECT_EQ(look(), _whole);
}

// Giving back cannot be refused.
bool Stage::refuses(bool is_up_call, const char* function, CMPIrc& code) {
    const std::string_view name = function;
    if (!_events || name == "release" || name == "detachThread" || name == "the text of a status" ||
        !_events->fails(is_up_call ? UP_CALL : BROKER))
        return false;
    code = _code;
    return true;
}

// As the first agent left them: what a change writes there is for its own life.
fs::path Stage::saved_settings() const {
    return _road.root() / "etc.saved";
}

void Stage::begin_life() {
    if (_lives)
        return;
    vlnsim_restart();
    if (fs::exists(saved_settings())) {
        fs::remove_all(_road.root() / "etc");
        fs::copy(saved_settings(), _road.root() / "etc", fs::copy_options::recursive);
    }
    _lives = true;
}

void Stage::end_life(const Point* point) {
    if (!_lives)
        return;
    EXPECT_TRUE(_road.manager().cleanup(true).ok());
    _lives = false;
    const host::Manager& manager = _road.manager();
    for (const host::Fault& fault : manager.faults())
        ADD_FAILURE() << "the broker's complaint: " << host::to_string(fault);
    EXPECT_EQ(manager.live_object_count(), 0u);
    char breach[256] = "";
    if (!(point && goes_on_blindly(*point)) && vlnsim_violation(0, breach, sizeof breach) == 0)
        ADD_FAILURE() << "a breach of the library's contract: " << breach;
    if (_threads) {
        EXPECT_EQ(settled(_threads, [] { return entries("/proc/self/task"); }), _threads);
        EXPECT_EQ(entries("/proc/self/fd"), _descriptors) << open_files();
    }
}

// The first class waits for the SAN pass.
std::string Stage::look() {
    std::string text;
    host::Manager& manager = _road.manager();
    manager.enumerate_names("VLNMPCA_StorageVolume");
    for (const host::Class* known : manager.provider_classes())
        for (const host::ObjectPath& path : manager.enumerate_names(known->name).value)
            text += host::path_to_text(path, "") + "\n";
    return text;
}

// All that a client can ask about a class, as far as its first instance goes.
std::string Stage::look_at(const std::string& class_name) {
    host::Manager& manager = _road.manager();
    std::ostringstream text;
    const auto names = manager.enumerate_names(class_name);
    text << names.status.rc << ' ' << names.value.size();
    const auto all = manager.enumerate(class_name);
    text << ' ' << all.status.rc;
    for (const host::Instance& instance : all.value)
        text << ' ' << host::path_to_text(instance.path, "") << ' ' << given(instance);
    if (names.value.empty())
        return text.str();
    const auto one = manager.get(names.value[0]);
    text << ' ' << one.status.rc << ' ' << given(one.value);
    if (!manager.classes().find(class_name)->is_association)
        return text.str();
    const host::Association_Filter via{class_name, "", "", ""};
    for (const host::Named_Value& end : names.value[0].keys) {
        host::ObjectPath source = *end.value.as_reference();
        source.name_space = "root/vorlan";
        for (const auto& found :
             {manager.associators(source, via), manager.references(source, via)})
            text << ' ' << found.status.rc << ' ' << found.value.size();
        for (const auto& found :
             {manager.associator_names(source, via), manager.reference_names(source, via)})
            text << ' ' << found.status.rc << ' ' << found.value.size();
    }
    return text.str();
}

// Loads all classes, and asks those that wait for a pass or begin something at their first call.
// How each class delivers what there is then is the point of the looks.
void Stage::fetch() {
    host::Core& core = *host::Core::any();
    host::Status status;
    for (const host::Class* known : _road.manager().provider_classes())
        core.module.instance(core, *known, status);
    for (const char* name : FIRST_CLASSES)
        _road.manager().enumerate_names(name);
}

std::string Stage::perform(const Operation& operation) {
    if (operation.is_refresh()) {
        fetch();
        const std::string answer = operation.is_judged ? look() : "";
        _road.manager().cleanup(true);
        return answer;
    }
    return operation.row ? _change->make() : look_at(operation.class_name);
}

std::vector<std::string> Stage::recorded_calls() const {
    std::vector<std::string> lines;
    char line[512];
    for (std::size_t i = 0; vlnsim_recorded_call(i, line, sizeof line) == 0; ++i)
        lines.emplace_back(line);
    return lines;
}

std::vector<Point> Stage::prepare(const Operation& operation, const Choice& choice, Counts& found) {
    _change.reset();
    if (operation.row) {
        begin_life();
        _change.emplace(_road, *operation.row);
    }
    if (!operation.class_name.empty()) {
        begin_life();
        look_at(operation.class_name); // what is made at the first use
        _objects = _road.manager().live_object_count();
    } else {
        end_life();
        begin_life();
        if (operation.row) {
            look();
            _change->make_ready();
        }
    }
    vlnsim_clear_calls();
    vlnsim_record_calls(1);
    for (int kind = 0; kind < KINDS; ++kind)
        _events->refuse(static_cast<Kind>(kind), 0);
    _healthy = perform(operation);
    vlnsim_record_calls(0);
    if (operation.row) {
        EXPECT_TRUE(_healthy == "CMPI_RC_OK" || _healthy == "CMPI_RC_OK 0") << _healthy;
    }
    std::vector<Point> points;
    for (int number = 0; number < KINDS; ++number) {
        const Kind kind = static_cast<Kind>(number);
        std::vector<Point> all = kind == CALL ? points_of_calls(recorded_calls())
                                              : points_of_events(kind, _events->made[kind]);
        found[kind] = all.size();
        for (Point& point : chosen(std::move(all), choice, operation, kind))
            points.push_back(std::move(point));
    }
    if (operation.class_name.empty())
        end_life();
    return points;
}

void Stage::arm(const Point& point) {
    _code = point.code;
    if (point.kind != CALL) {
        _events->refuse(point.kind, point.number);
        return;
    }
    EXPECT_EQ(vlnsim_fault(point.function.c_str(), point.call, point.fault, point.value), 0);
}

void Stage::disarm() {
    for (int kind = 0; kind < KINDS; ++kind)
        _events->refuse(static_cast<Kind>(kind), 0);
    vlnsim_clear_faults();
}

void Stage::run(const Operation& operation, const Point& point, bool whole) {
    if (!operation.class_name.empty()) {
        begin_life();
        arm(point);
        perform(operation);
        disarm();
        EXPECT_EQ(perform(operation), _healthy) << "the next look";
        EXPECT_LE(settled(_objects, [&] { return _road.manager().live_object_count(); }), _objects);
        for (const host::Fault& fault : _road.manager().faults())
            ADD_FAILURE() << "the broker's complaint: " << host::to_string(fault);
        return;
    }
    begin_life();
    if (operation.row) {
        EXPECT_EQ(look(), _whole) << "before the change";
        _change->make_ready();
    }
    arm(point);
    const std::string answer = perform(operation);
    disarm();
    if (operation.is_judged) {
        EXPECT_EQ(judged(point, _whole, answer), "") << point.line;
    }
    if (operation.row) { // the same agent goes on
        for (const char* name : FIRST_CLASSES)
            _road.manager().enumerate(name);
    }
    end_life(&point);
    if (operation.is_refresh() && whole) {
        begin_life();
        EXPECT_EQ(look(), _whole) << "the next agent";
        end_life();
    }
}

void Stage::close() {
    begin_life();
    EXPECT_EQ(look(), _whole) << "at the end";
    end_life();
    _road.close();
}

} // namespace sweep
