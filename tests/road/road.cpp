#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
// What the sanitizers add hides from the compiler that <regex> sets a member.
#pragma GCC diagnostic ignored "-Wmaybe-uninitialized"
#endif
#include "tests/road/road.h"

#include "host/path_text.h"

#include <fstream>
#include <regex>
#include <sstream>
#include <thread>

namespace road {

namespace fs = std::filesystem;

namespace {

constexpr std::uint64_t START = 1400000000ull * 1000000; // 2014-05-13, in microseconds
constexpr const char* LOG_FILE = "/opt/ibm/platform/log/vorlan_mpca_provider_ffdc.log";
constexpr const char* TRACE_FILE = "/var/log/provider-trace.log";

fs::path fresh_folder() {
    static int number = 0;
    const auto* test = testing::UnitTest::GetInstance()->current_test_info();
    fs::path folder = fs::current_path() / "roots" /
                      (std::string(test->test_suite_name()) + "." + test->name() + "." +
                       std::to_string(number++));
    for (char& c : const_cast<std::string&>(folder.native()))
        if (c == ' ')
            c = '_';
    fs::remove_all(folder);
    for (const char* sub : {"etc", "var/log", "tmp", "proc", "opt/ibm/platform/log"})
        fs::create_directories(folder / sub);
    std::ofstream(folder / "proc/version") << "Linux version 6.1.0 (simulated host)\n";
    std::ofstream(folder / "etc/issue") << "Debian GNU/Linux 12\n";
    return folder;
}

void load(const std::string& scenario) {
    char error[512] = "";
    const int status =
        scenario.starts_with("{")
            ? vlnsim_load_scenario_text(scenario.c_str(), "scenario", error, sizeof error)
            : vlnsim_load_scenario((std::string(VLN_SCENARIOS "/") + scenario).c_str(), error,
                                   sizeof error);
    ASSERT_EQ(status, 0) << error;
}

// A number that stands for a word according to the class, and has none there, tells a client
// nothing.
void expect_words(const host::Class& known, const host::Instance& instance) {
    for (const host::Named_Value& named : instance.properties) {
        const host::Property* property = known.find_property(named.name);
        if (!property || !property->meaning || !property->meaning->words)
            continue;
        const host::Value::Array one = {named.value};
        for (const host::Value& value : named.value.is_array() ? named.value.as_array() : one)
            EXPECT_TRUE(value.is_null() || host::word_of(*property, value).has_value())
                << "no word for " << known.name << "." << named.name << " "
                << text_of(instance, named.name);
    }
}

} // namespace

Road::Road(const Setup& setup) : _root(fresh_folder()) {
    vlnsim_reset();
    vlnsim_use_virtual_clock(START);
    vlnsim_set_host_root(_root.c_str());
    load(setup.scenario);
    if (setup.libraries) {
        char error[512] = "";
        EXPECT_EQ(vlnsim_open_libraries(error, sizeof error), 0) << error;
    }
    if (setup.log)
        std::ofstream(_root / "etc/vorlan_mpca_provider.dmp") << "2,5,1\n"
                                                              << _root.native() << TRACE_FILE;
    host::Options options;
    options.elements_marked_null = setup.elements_marked_null;
    options.trace = setup.trace;
    options.refuse = setup.refuse;
    options.registration_path = VLN_REGISTRATION;
    options.class_defaults = setup.class_defaults;
    options.platform_path = vlnsim_platform();
    if (!setup.platform.empty()) {
        options.platform_path = _root / "platform.json";
        std::ofstream(options.platform_path) << setup.platform;
    }
    _manager = std::make_unique<host::Manager>(std::move(options));
    const host::Status status = _manager->load(VLN_MODULE);
    EXPECT_TRUE(status.ok()) << status.message;
}

Road::~Road() {
    close();
}

void Road::close() {
    if (!_manager)
        return;
    _manager->close();
    for (const host::Fault& fault : _manager->faults())
        ADD_FAILURE() << "provider fault: " << host::to_string(fault);
    EXPECT_EQ(_manager->live_object_count(), 0u);
    for (std::size_t i = 0; i < vlnsim_violations(); ++i) {
        char text[256];
        vlnsim_violation(i, text, sizeof text);
        ADD_FAILURE() << "breach of the library's contract: " << text;
    }
    _manager.reset();
    vlnsim_close_libraries();
    vlnsim_reset();
}

std::vector<host::Instance> Road::enumerate(const std::string& class_name) {
    auto reply = _manager->enumerate(class_name);
    EXPECT_TRUE(reply.ok()) << class_name << ": " << host::rc_name(reply.status.rc);
    for (const host::Instance& instance : reply.value)
        expect_words(*_manager->classes().find(instance.class_name()), instance);
    return std::move(reply.value);
}

std::map<std::string, std::size_t> Road::census() {
    std::map<std::string, std::size_t> counts;
    for (const host::Class* known : _manager->provider_classes())
        if (const std::size_t count = enumerate(known->name).size())
            counts[known->name] = count;
    return counts;
}

std::string Road::log_text() const {
    std::string text;
    for (const char* file : {LOG_FILE, TRACE_FILE}) {
        std::ifstream in(_root.native() + file);
        std::stringstream content;
        content << in.rdbuf();
        text += content.str();
    }
    return text;
}

std::size_t Road::count_in_log(const std::string& text) const {
    const std::string log = log_text();
    std::size_t count = 0;
    for (std::size_t at = log.find(text); at != std::string::npos; at = log.find(text, at + 1))
        ++count;
    return count;
}

std::string Road::faults_in_log() const {
    std::istringstream log(log_text());
    std::string faults;
    for (std::string line; std::getline(log, line);)
        if (line.find("VLN_CRIT]") != std::string::npos &&
            line.find("Continuing logs in Vorlan log provider") == std::string::npos)
            faults += line + "\n";
    return faults;
}

void Road::wait_for_refreshes(std::size_t count) {
    constexpr int LIMIT = 100000;
    for (int i = 0; i < LIMIT; ++i) {
        if (count_in_log("PERF: DataFetch_Handler Thread END") >= count)
            return;
        std::this_thread::yield();
    }
    FAIL() << "no refresh number " << count << " within bounds";
}

std::string text_of(const host::Instance& instance, const std::string& property) {
    const host::Value* value = instance.property(property);
    if (!value || value->is_null())
        return "-";
    if (!value->is_array())
        return value->type == CMPI_string ? value->as_text()
                                          : host::scalar_to_text(*value, "root/vorlan");
    std::string text = "{";
    for (const host::Value& element : value->as_array()) {
        if (text.size() > 1)
            text += ", ";
        text += element.type == CMPI_string ? element.as_text()
                                            : host::scalar_to_text(element, "root/vorlan");
    }
    return text + "}";
}

host::Instance instance_of(Road& road, const std::string& text) {
    static const std::regex form(R"((\w+)(#(\d+))?(\[(\w+)=([^\]]*)\])?(!(\w+)=(.*))?)");
    std::smatch parts;
    if (!std::regex_match(text, parts, form))
        throw std::runtime_error("no name of an instance: " + text);
    std::size_t number = parts[3].matched ? std::stoul(parts[3]) : 1;
    for (host::Instance& instance : road.enumerate(parts[1])) {
        if ((parts[4].matched && text_of(instance, parts[5]) != parts[6]) || --number != 0)
            continue;
        if (parts[7].matched)
            for (host::Named_Values* values : {&instance.path.keys, &instance.properties})
                if (host::find(*values, parts[8].str()))
                    host::set(*values, parts[8].str(), host::Value::text(parts[9]));
        return std::move(instance);
    }
    throw std::runtime_error("no " + text);
}

std::string filled_in(Road& road, const std::string& text) {
    const std::size_t begin = text.find('<'), end = text.find('>', begin);
    if (begin == std::string::npos || end == std::string::npos)
        return text;
    const std::string name = text.substr(begin + 1, end - begin - 1);
    return text.substr(0, begin) +
           (name.empty() ? road.root().string()
                         : host::path_to_text(instance_of(road, name).path, "")) +
           text.substr(end + 1);
}

} // namespace road
