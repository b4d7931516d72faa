#include "host/faults.h"

#include <algorithm>

namespace host {

const char* to_string(FaultKind kind) {
    switch (kind) {
    case FaultKind::unknown_class:
        return "unknown class";
    case FaultKind::unknown_property:
        return "unknown property";
    case FaultKind::type_mismatch:
        return "type mismatch";
    case FaultKind::bad_path:
        return "bad object path";
    case FaultKind::bad_text:
        return "text that is no UTF-8";
    case FaultKind::bad_argument:
        return "bad argument";
    case FaultKind::wrong_result:
        return "wrong result";
    case FaultKind::bad_output:
        return "bad method output";
    case FaultKind::double_release:
        return "double release";
    case FaultKind::use_after_release:
        return "use after release";
    case FaultKind::foreign_object:
        return "foreign object";
    case FaultKind::released_parameter:
        return "release of a parameter";
    case FaultKind::stale_element:
        return "stale array element";
    case FaultKind::unattached_thread:
        return "thread not attached";
    case FaultKind::dead_broker:
        return "dead broker";
    case FaultKind::attachment:
        return "attachment of a thread";
    case FaultKind::left_at_detach:
        return "left at detachThread";
    case FaultKind::recursion:
        return "recursive up-call";
    case FaultKind::leak:
        return "leak";
    case FaultKind::interface:
        return "interface";
    }
    return "fault";
}

std::string to_string(const Fault& fault) {
    std::string text = fault.class_name;
    if (!fault.operation.empty())
        text += (text.empty() ? "" : " ") + fault.operation;
    if (!text.empty())
        text += ": ";
    return text + to_string(fault.kind) + ": " + fault.text;
}

void FaultList::add(Fault fault) {
    const std::lock_guard lock(_mutex);
    ++_total;
    if (_faults.size() < kept)
        _faults.push_back(std::move(fault));
}

std::vector<Fault> FaultList::all() const {
    const std::lock_guard lock(_mutex);
    return _faults;
}

std::size_t FaultList::count() const {
    const std::lock_guard lock(_mutex);
    return _total;
}

std::size_t FaultList::count(FaultKind kind) const {
    const std::lock_guard lock(_mutex);
    return static_cast<std::size_t>(std::count_if(
        _faults.begin(), _faults.end(), [kind](const Fault& fault) { return fault.kind == kind; }));
}

void FaultList::clear() {
    const std::lock_guard lock(_mutex);
    _faults.clear();
    _total = 0;
}

} // namespace host
