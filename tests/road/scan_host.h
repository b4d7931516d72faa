// A simulated host with the device layer of the product on it: its scans alone, without an object
// manager above them, so that what they call and what they find can be told exactly.
#ifndef TESTS_ROAD_SCAN_HOST_H
#define TESTS_ROAD_SCAN_HOST_H

#include "device/data.h"
#include "operations/method_wrapper.h"
#include "simulator/vlnsim.h"

#include <map>
#include <memory>
#include <string>
#include <vector>

namespace road {

// How often each function of the libraries was called; those never called are not in it.
using Calls = std::map<std::string, unsigned long>;

class Scan_Host {
public:
    // Loads a scenario, by its text if that begins with a brace, else by its file; opens the
    // simulated libraries and binds the product to them. One at a time. Throws std::runtime_error.
    explicit Scan_Host(const std::string& scenario);
    ~Scan_Host();
    Scan_Host(const Scan_Host&) = delete;
    Scan_Host& operator=(const Scan_Host&) = delete;

    // Run one scan each and answer what it called.
    Calls adapter_scan();
    Calls san_scan();

    // A line for each target of each port, with all that the scan has found out about it.
    std::vector<std::string> targets() const;

    cimple::VLN_Data& data() { return *_data; }

private:
    std::unique_ptr<cimple::VLN_MethodWrapper> _wrapper;
    std::unique_ptr<cimple::VLN_Data> _data;
};

} // namespace road

#endif // TESTS_ROAD_SCAN_HOST_H
