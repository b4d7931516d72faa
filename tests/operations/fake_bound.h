// Bound functions of the tests: each forwards to a handler that a test sets.
#ifndef TESTS_OPERATIONS_FAKE_BOUND_H
#define TESTS_OPERATIONS_FAKE_BOUND_H

#include "device/library/bound_functions.h"

#include <functional>
#include <map>
#include <vector>

struct Fake_Bound {
    std::function<AX_STATUS()> initLib = [] { return AX_STATUS_OK; };
    std::function<AX_STATUS(char*, uint32_t*)> version;
    std::function<AX_STATUS(AX_WWN, uint8_t*)> featureList;
    AX_STATUS isLocalStatus = AX_STATUS_OK;
    uint32_t isLocal = 1;
    std::map<uint32_t, uint32_t> features;         // identifier to value; others are 0
    std::map<uint32_t, AX_STATUS> featureFailures; // identifier to status
    std::vector<uint32_t> featureQueries;
    const char* statusText = "";
    std::function<AX_STATUS(AX_ServerAttributes*)> serverAttributes;
};

extern Fake_Bound fake;

#endif // TESTS_OPERATIONS_FAKE_BOUND_H
