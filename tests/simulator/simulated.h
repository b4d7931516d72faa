// Shared by the simulator's tests: a scenario, and the libraries as a provider opens them.
#ifndef TESTS_SIMULATOR_SIMULATED_H
#define TESTS_SIMULATOR_SIMULATED_H

#include "device/library/axapi.h"
#include "simulator/vlnsim.h"

#include <dlfcn.h>
#include <gtest/gtest.h>
#include <string>
#include <vector>

// A library opened by its bare file name, while the simulator's is loaded already.
class Opened_Library {
public:
    explicit Opened_Library(const char* file) : _handle(dlopen(file, RTLD_NOW)) {}
    ~Opened_Library() {
        if (_handle)
            dlclose(_handle);
    }
    Opened_Library(const Opened_Library&) = delete;
    Opened_Library& operator=(const Opened_Library&) = delete;

    explicit operator bool() const { return _handle != nullptr; }
    template <class Function>
    Function* find(const char* symbol) const {
        return reinterpret_cast<Function*>(dlsym(_handle, symbol));
    }

private:
    void* _handle;
};

// The functions by their bound names: LOCAL(AX_GetVersion)(...) calls what the local library
// exports.
#define LOCAL(function) (*laxapi().find<decltype(function)>(local_symbol(#function).c_str()))
#define HBA(function) (*hbaapi().find<decltype(function)>(#function))

class Simulated : public testing::Test {
protected:
    void SetUp() override;
    void TearDown() override;

    // A scenario by its file name or its text; the libraries are opened and initialised.
    void start(const std::string& file);
    void start_text(const std::string& text);

    Opened_Library& laxapi() { return *_laxapi; }
    Opened_Library& hbaapi() { return *_hbaapi; }
    static std::string local_symbol(const std::string& function);

    // The WWN of the nth instance, by the record calls.
    AX_WWN wwn_of(std::uint32_t index);
    HBAIdentifier identifier_of(std::uint32_t index);
    std::string attribute_text(std::vector<std::uint8_t>& buffer, std::uint16_t identifier);

    static std::vector<std::string> recorded();
    static std::vector<std::string> violations();

private:
    void open();

    std::unique_ptr<Opened_Library> _laxapi;
    std::unique_ptr<Opened_Library> _hbaapi;
};

// One card with one NIC, in as few words as a scenario takes.
inline constexpr const char* small_scenario = R"({"cards": [{
    "type": "nic", "model": "M1", "serial": "S1", "wwpn": "1000024500000001", "functions": [{}]}]})";

#endif // TESTS_SIMULATOR_SIMULATED_H
