// The parts of operations: classes, paths, values; and what they are taken from.
#include "fuzz/operations.h"

#include "tools/mpcactl/assignment.h"

#include <fstream>
#include <iterator>
#include <sstream>

namespace fuzz {

using host::Named_Value;
using host::ObjectPath;
using host::Value;

namespace {

constexpr std::size_t MOST_VALUES = 64; // of one name
constexpr std::size_t MOST_TEXTS = 4000;
constexpr std::size_t LONG_TEXT = 70000; // beyond any buffer of the library
constexpr std::size_t LONG_ARRAY = 300;  // elements
constexpr unsigned DEEPEST = 3;          // instances in instances

constexpr CMPIType TYPES[] = {CMPI_boolean, CMPI_uint8,    CMPI_uint16, CMPI_uint32,
                              CMPI_uint64,  CMPI_sint8,    CMPI_sint16, CMPI_sint32,
                              CMPI_sint64,  CMPI_real32,   CMPI_real64, CMPI_char16,
                              CMPI_string,  CMPI_dateTime, CMPI_ref,    CMPI_instance};

constexpr std::uint64_t NUMBERS[] = {0,
                                     1,
                                     2,
                                     3,
                                     4,
                                     5,
                                     7,
                                     8,
                                     9,
                                     10,
                                     15,
                                     16,
                                     31,
                                     32,
                                     63,
                                     64,
                                     99,
                                     100,
                                     127,
                                     128,
                                     254,
                                     255,
                                     256,
                                     1023,
                                     4094,
                                     4095,
                                     4096,
                                     32767,
                                     32768,
                                     65534,
                                     65535,
                                     65536,
                                     2147483647,
                                     2147483648,
                                     4294967295,
                                     4294967296,
                                     9223372036854775807,
                                     ~std::uint64_t{0}};

constexpr const char* TEXTS[] = {"",
                                 " ",
                                 ",",
                                 "=",
                                 "0",
                                 "-1",
                                 "*",
                                 "%n%s%s",
                                 "../../etc/passwd",
                                 "/",
                                 "\xff\xfe",
                                 "\xc3\x28",
                                 "a\nb",
                                 "\"",
                                 "\\",
                                 "0x",
                                 "10:00:00:00:00:00:00:00",
                                 "ff:ff:ff:ff:ff:ff:ff:ff",
                                 "255.255.255.255",
                                 "0.0.0.0",
                                 "::",
                                 "fe80::1",
                                 "iqn.",
                                 "99999999999999999999",
                                 "Enabled",
                                 "true",
                                 "No"};

constexpr const char* DATETIMES[] = {"20140513165320.000000+000", "00000000000000.000000:000",
                                     "99999999235959.999999:000", "19700101000000.000000-720",
                                     "20000229******.******+***"};

template <class T, std::size_t size>
const T& any_of(Input& input, const T (&table)[size]) {
    return table[input.byte() % size];
}

std::uint64_t any_number(Input& input) {
    if (const unsigned choice = input.byte(); choice < 192)
        return NUMBERS[choice % std::size(NUMBERS)];
    const std::uint64_t high = input.word();
    return high << 32 | input.word();
}

Value number_of(CMPIType type, std::uint64_t number) {
    const auto bits = [&](auto width) { return static_cast<decltype(width)>(number); };
    switch (type) {
    case CMPI_uint8:
        return Value::unsigned_number(type, bits(std::uint8_t{}));
    case CMPI_char16:
    case CMPI_uint16:
        return Value::unsigned_number(type, bits(std::uint16_t{}));
    case CMPI_uint32:
        return Value::unsigned_number(type, bits(std::uint32_t{}));
    case CMPI_uint64:
        return Value::unsigned_number(type, number);
    case CMPI_sint8:
        return Value::signed_number(type, bits(std::int8_t{}));
    case CMPI_sint16:
        return Value::signed_number(type, bits(std::int16_t{}));
    case CMPI_sint32:
        return Value::signed_number(type, bits(std::int32_t{}));
    default:
        return Value::signed_number(type, bits(std::int64_t{}));
    }
}

} // namespace

// ---- What parts are taken from ----

Operations& Operations::instance() {
    static Simulated_Host& host = *new Simulated_Host(VLN_MODULE, VLN_SCENARIOS "/everything.json");
    static Operations& operations = *new Operations(host);
    return operations;
}

Operations::Operations(Simulated_Host& host) : _host(host) {
    for (const Stocked_Class& stocked : host.stock()) {
        if (stocked.known->is_association)
            _associations.push_back(stocked.known);
        for (const host::Method& method : stocked.known->methods)
            _methods.push_back({stocked.known, &method});
        for (const host::Instance& instance : stocked.instances)
            collect(instance);
    }
    read_changes();
    FUZZ_CHECK(!_associations.empty() && !_methods.empty() && !_changes.empty());
}

void Operations::collect(const host::Instance& instance) {
    for (const Named_Value& named : instance.properties) {
        std::vector<Value>& known = _values[named.name];
        if (known.size() < MOST_VALUES && !named.value.is_null())
            known.push_back(named.value);
        if (_texts.size() < MOST_TEXTS && named.value.type == CMPI_string && !named.value.is_null())
            _texts.push_back(named.value.as_text());
    }
}

void Operations::read_changes() {
    std::ifstream file(VLN_CHANGES);
    for (std::string line; std::getline(file, line);)
        try {
            read_change(line);
        } catch (const std::exception&) {
            // It is for another scenario.
        }
}

void Operations::read_change(const std::string& line) {
    std::istringstream fields(line);
    std::string scenario, what;
    std::getline(fields, scenario, '\t');
    std::getline(fields, what, '\t');
    std::vector<std::string> assignments;
    for (std::string value; std::getline(fields, value, '\t');)
        assignments.push_back(filled_in(value));
    Change change{'=', "", {}, {}};
    if (what.starts_with('&')) // what the next row needs done before
        what.erase(0, 1);
    if (what.starts_with('+') || what.starts_with('-')) {
        change.kind = what[0];
        what.erase(0, 1);
    }
    if (const std::size_t dot = what.find('.'); dot != std::string::npos) {
        change.kind = '.';
        change.method = what.substr(dot + 1);
        what.erase(dot);
    }
    if (change.kind == '+')
        change.instance.path = {"root/vorlan", what, {}};
    else if (const host::Instance* found = find(what))
        change.instance = *found;
    else
        return;
    const host::ClassRepository& classes = _host.core().classes;
    const host::Class* const known = classes.find(change.instance.class_name());
    const host::Method* const method = known ? known->find_method(change.method) : nullptr;
    if (!known || (change.kind == '.' && !method))
        return;
    change.values = method ? mpcactl::read_inputs(classes, *method, assignments, "root/vorlan")
                           : mpcactl::read_properties(classes, *known, assignments, "root/vorlan");
    for (const Named_Value& named : change.values)
        _values[named.name].push_back(named.value);
    _changes.push_back(std::move(change));
}

// With the path of the first instance for <CLASS>, and the host's root for <>.
std::string Operations::filled_in(const std::string& text) const {
    const std::size_t begin = text.find('<'), end = text.find('>');
    if (begin == std::string::npos || end == std::string::npos)
        return text;
    const std::string name = text.substr(begin + 1, end - begin - 1);
    const host::Instance* const found = find(name);
    const std::string filling = name.empty() ? _host.root()
                                : found      ? host::path_to_text(found->path, "")
                                             : "";
    return text.substr(0, begin) + filling + text.substr(end + 1);
}

const host::Instance* Operations::find(const std::string& class_and_number) const {
    const std::size_t mark = std::min(class_and_number.find('#'), class_and_number.size());
    const std::size_t number =
        mark < class_and_number.size() ? std::stoul(class_and_number.substr(mark + 1)) : 1;
    const std::vector<host::Instance>* const all = _host.stock_of(class_and_number.substr(0, mark));
    return all && !all->empty() ? &(*all)[std::min(number, all->size()) - 1] : nullptr;
}

// ---- Parts ----

const Stocked_Class& Operations::any_class(Input& input) const {
    const std::vector<Stocked_Class>& all = _host.stock();
    return all[input.below(static_cast<std::uint32_t>(all.size()))];
}

const host::Instance* Operations::any_instance(Input& input) const {
    const Stocked_Class& stocked = any_class(input);
    return stocked.instances.empty() ? nullptr
                                     : &stocked.instances[input.byte() % stocked.instances.size()];
}

ObjectPath Operations::any_path(Input& input, const Stocked_Class& stocked) {
    const unsigned choice = input.byte();
    ObjectPath path{"root/vorlan", stocked.known->name, {}};
    if (!stocked.instances.empty())
        path = stocked.instances[input.byte() % stocked.instances.size()].path;
    if (choice < 176)
        return path;
    if (choice < 208 && !path.keys.empty()) { // a key is another one
        Named_Value& key = path.keys[input.byte() % path.keys.size()];
        host::Slot_Type slot;
        slot.type = key.value.type;
        key.value = any_value(input, slot, key.name);
    } else if (choice < 216 && !path.keys.empty()) { // one is missing
        path.keys.erase(path.keys.begin() +
                        input.byte() % static_cast<std::ptrdiff_t>(path.keys.size()));
    } else if (choice < 224) { // one too many
        path.keys.push_back({any_text(input), plain_value(input, any_of(input, TYPES), false)});
    } else if (choice < 232) {
        path.keys.clear();
    } else if (choice < 240) {
        path.name_space = any_text(input);
    } else if (const host::Instance* other = any_instance(input)) { // of another class
        path.keys = other->path.keys;
        if (choice < 248)
            path.class_name = other->path.class_name;
    }
    return path;
}

host::Property_List Operations::any_properties(Input& input, const host::Class& known) const {
    if (input.byte() < 160)
        return std::nullopt;
    std::vector<std::string> names;
    for (unsigned count = input.byte() % 4; count > 0; --count)
        names.push_back(input.byte() < 224 && !known.properties.empty()
                            ? known.properties[input.byte() % known.properties.size()].name
                            : any_text(input));
    return names;
}

// A text of the host's, a special one, one of the input's own bytes, a very long one.
std::string Operations::any_text(Input& input) const {
    const unsigned choice = input.byte();
    if (choice < 112 && !_texts.empty())
        return _texts[input.below(static_cast<std::uint32_t>(_texts.size()))];
    if (choice < 176)
        return any_of(input, TEXTS);
    if (choice == 255)
        return std::string(LONG_TEXT, 'a');
    std::string text(choice - 176u, '\0');
    input.fill(text.data(), text.size());
    std::erase(text, '\0');
    return text;
}

Value Operations::plain_value(Input& input, CMPIType type, bool embedded) {
    if (type & CMPI_ARRAY) {
        const auto element = static_cast<CMPIType>(type & ~CMPI_ARRAY);
        const unsigned choice = input.byte();
        std::size_t count = choice < 252 ? choice % 6 : choice == 255 ? LONG_ARRAY : 16;
        if (_depth > 0)
            count = std::min<std::size_t>(count, 2);
        Value::Array elements;
        for (; count > 0; --count)
            elements.push_back(choice % 16 == 15 && count % 2
                                   ? Value::null(element)
                                   : plain_value(input, element, embedded));
        return Value::array(element, std::move(elements));
    }
    if (type == CMPI_boolean)
        return Value::boolean(input.byte() % 2);
    if (type == CMPI_real32 || type == CMPI_real64)
        return Value::real(type, static_cast<double>(any_number(input)));
    if (type == CMPI_dateTime)
        return Value::datetime(any_of(input, DATETIMES));
    if (type == CMPI_ref || type == CMPI_instance || (embedded && input.byte() < 240)) {
        if (_depth >= DEEPEST)
            return Value::null(type);
        ++_depth;
        Value value = Value::null(type);
        if (type == CMPI_ref)
            value = Value::reference(any_path(input, any_class(input)));
        else if (const host::Instance* found = any_instance(input))
            value = Value::instance(*found);
        --_depth;
        return value;
    }
    if (type == CMPI_string || type == CMPI_chars)
        return Value::text(any_text(input));
    return number_of(type, any_number(input));
}

// Of the slot's type, or what another one of its name holds; null; of another type.
Value Operations::any_value(Input& input, const host::Slot_Type& slot, const std::string& name) {
    const unsigned choice = input.byte();
    if (choice < 96) {
        const auto found = _values.find(name);
        if (found != _values.end() && !found->second.empty())
            return found->second[input.byte() % found->second.size()];
    }
    if (choice < 208)
        return plain_value(input, slot.type, slot.embedded);
    if (choice < 216)
        return Value::null(slot.type);
    const CMPIType other = any_of(input, TYPES);
    if (choice < 240)
        return plain_value(input, other, false);
    return plain_value(input, static_cast<CMPIType>(other | CMPI_ARRAY), false);
}

} // namespace fuzz

// Before the first input, so that the module's counters are there when counting begins.
extern "C" int LLVMFuzzerInitialize(int*, char***) {
    fuzz::Operations::instance();
    return 0;
}

// The search for leaks stops all threads, and those of the module do not bear it. What an input
// leaves of the broker's is counted; the test suite searches for the rest.
extern "C" const char* __asan_default_options() {
    return "detect_leaks=0:malloc_context_size=4:max_malloc_fill_size=0:quarantine_size_mb=32";
}
