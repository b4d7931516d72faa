#include "simulator/call.h"

#include <algorithm>
#include <cstring>

namespace vlnsim {
namespace {

constexpr std::uint8_t soil_byte = 0xA5;

std::string hexadecimal(std::uint64_t wwn) {
    char text[17];
    std::snprintf(text, sizeof text, "%016llX", static_cast<unsigned long long>(wwn));
    return text;
}

std::uint64_t name_of(AX_WWN wwn) {
    std::uint8_t bytes[8];
    std::memcpy(bytes, &wwn, sizeof bytes);
    return get_name(bytes);
}

// These work on a caller's buffer or on a number alone.
bool needs_no_library(Entry entry) {
    return entry == Entry::AX_InitLib || entry == Entry::AX_StatusString ||
           entry == Entry::AX_GetAttributeValue || entry == Entry::AX_GetNextVpdEntry ||
           entry == Entry::HBA_LoadLibrary;
}

bool is_hba(Entry entry) {
    return std::string_view(entry_name(entry)).starts_with("HBA_");
}

} // namespace

std::string shown(AX_WWN wwn) {
    return hexadecimal(name_of(wwn));
}
std::string shown(HBA_WWN wwn) {
    return hexadecimal(get_name(wwn.wwn));
}
std::string shown(const char* text) {
    return text ? '"' + std::string(text) + '"' : "null";
}
std::string shown(const void* pointer) {
    return pointer ? "buffer" : "null";
}

bool Call::null(const void* pointer, const char* name) {
    if (pointer)
        return false;
    violation(std::string(name) + " is null");
    return true;
}

Function* Call::function(AX_WWN wwn) {
    Function* found = sim.find_function(name_of(wwn));
    if (!found && !sim.is_former_name(name_of(wwn)))
        violation("unknown WWN " + shown(wwn));
    return found;
}

Function* Call::function_or_dead_port(AX_WWN wwn) {
    Function* dead = sim.find_dead_port(name_of(wwn));
    return dead ? dead : function(wwn);
}

bool Call::too_small(std::uint64_t room, std::uint32_t& needed) const {
    if (forced_size) {
        if (*forced_size)
            needed = static_cast<std::uint32_t>(*forced_size);
        return true;
    }
    return room < needed;
}

bool Call::list_too_small(std::uint32_t& count, std::size_t entries) {
    out("room", count);
    auto needed = static_cast<std::uint32_t>(entries);
    const bool missing = too_small(count, needed);
    count = needed;
    out("count", count);
    return missing;
}

std::uint64_t Call::take_faults() {
    ++sim.calls[static_cast<unsigned>(_entry)];
    const std::string_view name = entry_name(_entry);
    std::uint64_t delay = 0;
    bool taken = false;
    for (Fault& fault : sim.faults) {
        if (fault.kind == VLNSIM_ABSENT || (fault.function != "*" && fault.function != name))
            continue;
        // A rule for one call counts down at each call that it watches, whether or not another is
        // taken.
        const bool now = fault.nth == 0 || fault.nth == 1;
        if (fault.nth > 1)
            --fault.nth;
        else if (fault.nth == 1)
            fault.function.clear(); // used up
        if (!now)
            continue;
        if (fault.kind == VLNSIM_DELAY) {
            delay += fault.value;
        } else if (fault.kind == VLNSIM_HOLD) {
            is_held = true;
        } else if (!taken) {
            taken = true;
            (fault.kind == VLNSIM_STATUS      ? forced_status
             : fault.kind == VLNSIM_TOO_SMALL ? forced_size
                                              : missing) = fault.value;
        }
    }
    std::erase_if(sim.faults, [](const Fault& fault) { return fault.function.empty(); });
    return delay;
}

bool Call::ready() {
    if (needs_no_library(_entry))
        return true;
    if (is_hba(_entry) ? sim.hba_loaded : sim.initialised)
        return true;
    violation(is_hba(_entry) ? "called before HBA_LoadLibrary" : "called before AX_InitLib");
    return false;
}

void Call::finish(const std::string& arguments, const std::string& result) {
    const std::string line =
        std::string(entry_name(_entry)) + "(" + arguments + ") = " + result + results;
    if (sim.trace)
        std::fprintf(sim.trace, "%s\n", line.c_str());
    if (sim.recording)
        sim.recorded.push_back(line);
}

std::uint32_t unready_answer(Entry entry) {
    switch (entry) {
    case Entry::AX_GetNumberOfLocalAdapters:
    case Entry::HBA_GetNumberOfAdapters:
    case Entry::HBA_OpenAdapter:
        return 0;
    default:
        return AX_STATUS_ERROR;
    }
}

void copy_text(const std::string& text, char* destination, std::size_t room) {
    if (room == 0)
        return;
    const std::size_t length = std::min(text.size(), room - 1);
    std::memcpy(destination, text.data(), length);
    destination[length] = 0;
}

void soil(void* buffer, std::size_t used, std::size_t size) {
    if (size > used)
        std::memset(static_cast<std::uint8_t*>(buffer) + used, soil_byte, size - used);
}

} // namespace vlnsim
