#include "simulator/scenario.h"

#include "simulator/call.h"
#include "simulator/entry_points.h"
#include "simulator/vlnsim.h"

#include <arpa/inet.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <functional>
#include <set>

namespace vlnsim {
namespace {

constexpr std::size_t max_include_depth = 8;
constexpr std::uint64_t max_cards = 256;
constexpr std::uint64_t max_ports = 16;

// A path that a file tells is meant from its own folder.
std::string beside(const std::string& file, const std::string& path) {
    return path.starts_with("/") ? path : file.substr(0, file.rfind('/') + 1) + path;
}

// The document with everything that it includes below it.
Value with_includes(const std::string& text, const std::string& name, std::size_t depth) {
    const Value document = parse_source(text, name);
    const Scope scope;
    const Node top(document, scope);
    top.expect_any_object();
    const auto include = top.member("include");
    if (!include)
        return document;
    if (depth == max_include_depth)
        include->fail("files include one another too deeply");
    Value base;
    base.kind = Value::Kind::object;
    for (const Node& file : include->items_or_self()) {
        const std::string path = beside(name, file.text());
        std::string content;
        try {
            content = read_file(path);
        } catch (const Scenario_Error&) {
            file.fail("cannot read " + path);
        }
        base = merged(base, with_includes(content, path, depth + 1));
    }
    return merged(base, document);
}

// Replaces "use" by the templates that it names, below the object's own values.
class Templates {
public:
    explicit Templates(const Node& top) : _top(top) {
        if (const auto templates = top.member("templates"))
            templates->expect_any_object();
    }

    Value expanded(const Value& object, std::size_t depth = 0) const {
        const Node node(object, _top.scope());
        node.expect_any_object();
        const auto use = node.member("use");
        if (!use)
            return object;
        if (depth == max_include_depth)
            use->fail("templates use one another too deeply");
        Value result = object;
        result.members.clear();
        for (const Node& name : use->items_or_self())
            result = merged(result, expanded(find(name), depth + 1));
        Value own = object;
        std::erase_if(own.members, [](const Member& member) { return member.first == "use"; });
        return merged(result, own);
    }

private:
    const Value& find(const Node& name) const {
        const auto templates = _top.member("templates");
        const Value* found = templates ? templates->value().find(name.text()) : nullptr;
        if (!found) {
            std::vector<std::string_view> known;
            if (templates)
                for (const auto& member : templates->value().members)
                    known.push_back(member.first);
            name.fail("unknown template \"" + name.text() + "\"; " + known_list(known));
        }
        return *found;
    }

    Node _top;
};

// The members that are values of a function, without those that only shape the tree.
Value function_values(const Value& object, std::initializer_list<std::string_view> structure) {
    Value values = object;
    std::erase_if(values.members, [&](const Member& member) {
        return std::find(structure.begin(), structure.end(), member.first) != structure.end();
    });
    return values;
}

void expect_function_keys(const Value& object, const Scope& scope,
                          std::initializer_list<std::string_view> structure) {
    std::vector<std::string_view> known(structure);
    known.insert(known.end(), function_keys().begin(), function_keys().end());
    Node(object, scope).expect_object(known);
}

class Card_Reader {
public:
    Card_Reader(const Node& top, Host& host) : _templates(top), _host(host) {}

    void read(const Node& source) {
        const Value card = _templates.expanded(source.value());
        const Node node(card, source.scope());
        expect_function_keys(card, source.scope(), {"count", "ports", "functions"});
        const std::uint64_t count = node.number("count", 1, max_cards);
        for (std::uint64_t i = 0; i < count; ++i, ++_card)
            read_one(node, card);
    }

private:
    void read_one(const Node& card, const Value& values) {
        const Scope scope = card.scope().with("card", _card);
        const std::vector<Value> ports = read_ports(card);
        const auto functions = card.member("functions");
        if (!functions)
            card.fail("\"functions\" is wanted: what the card does");
        const Value base = function_values(values, {"count", "ports", "functions"});
        std::uint64_t pci = 0;
        for (const Node& function : functions->items())
            for (std::size_t port = 0; port < ports.size(); ++port, ++pci) {
                const Value own = _templates.expanded(function.value());
                expect_function_keys(own, scope, {});
                const Value all = merged(merged(base, ports[port]), own);
                const Scope inner = scope.with("port", port)
                                        .with("function", pci)
                                        .with("instance", _host.functions.size());
                Function made = read_function(Node(all, inner));
                made.card = static_cast<std::uint32_t>(_card);
                add(std::move(made), function);
            }
    }

    std::vector<Value> read_ports(const Node& card) const {
        std::vector<Value> ports;
        const auto node = card.member("ports");
        Value empty;
        empty.kind = Value::Kind::object;
        if (!node || !node->is(Value::Kind::list)) {
            ports.assign(node ? static_cast<std::size_t>(node->number(max_ports)) : 1, empty);
            return ports;
        }
        for (const Node& port : node->items()) {
            ports.push_back(_templates.expanded(port.value()));
            expect_function_keys(ports.back(), port.scope(), {});
        }
        return ports;
    }

    void add(Function made, const Node& source) {
        if (made.dead) {
            _host.dead_ports.push_back(std::move(made));
            return;
        }
        for (const Function& other : _host.functions) {
            if (other.wwpn == made.wwpn)
                source.fail("\"wwpn\" is that of another function; a placeholder such as {port} or "
                            "{instance} makes it its own");
            if (other.instance == made.instance)
                source.fail("\"instance\" " + std::to_string(made.instance) +
                            " is that of another function");
        }
        _host.functions.push_back(std::move(made));
    }

    Templates _templates;
    Host& _host;
    std::uint64_t _card = 0;
};

Library read_library(const Node& values) {
    values.expect_object({"present", "missing", "extra"});
    Library library;
    library.present = values.boolean("present", true);
    const auto symbols = [&](std::string_view key, std::vector<std::string>& list) {
        const auto node = values.member(key);
        if (!node)
            return;
        for (const Node& symbol : node->items()) {
            list.push_back(symbol.text());
            if (!is_symbol_name(list.back()))
                symbol.fail("no library exports \"" + list.back() + "\"");
        }
    };
    symbols("missing", library.missing);
    symbols("extra", library.extra);
    return library;
}

void read_libraries(const Node& values, Host& host) {
    values.expect_object({"local", "fallback", "hba", "initialisation", "versions"});
    constexpr std::array<std::string_view, 3> names{"local", "fallback", "hba"};
    for (std::size_t i = 0; i < names.size(); ++i)
        if (const auto library = values.member(names[i]))
            host.libraries[i] = read_library(*library);
    host.initialisation = values.number32("initialisation", AX_STATUS_OK);
    if (const auto versions = values.member("versions")) {
        versions->expect_object({"axapi", "nima"});
        host.axapi_version = versions->text("axapi", host.axapi_version);
        host.nima_version = versions->text("nima", host.nima_version);
    }
}

void read_server(const Node& values, Host& host) {
    values.expect_object({"hostName", "targetOS", "address"});
    const auto copy = [&](std::string_view key, char* field, std::size_t size) {
        const auto node = values.member(key);
        if (!node)
            return;
        const std::string text = values.wild_text(key, {});
        if (text.size() >= size)
            node->fail("longer than " + std::to_string(size - 1) + " bytes");
        copy_text(text, field, size);
    };
    copy("hostName", host.server.hostName, sizeof host.server.hostName);
    copy("targetOS", host.server.targetOS, sizeof host.server.targetOS);
    if (const auto address = values.member("address")) {
        host.address = address->text();
        in_addr parsed{};
        if (!host.address.empty() && inet_pton(AF_INET, host.address.c_str(), &parsed) != 1)
            address->fail("\"" + host.address + "\" is not an IPv4 address");
    }
}

std::uint64_t fault_identifier(const Node& node) {
    if (node.is(Value::Kind::number))
        return node.number(0xFFFF);
    const std::string name = node.text();
    std::set<std::uint32_t> found;
    for (const auto table :
         {adapter_attribute_identifiers(), port_attribute_identifiers(), statistic_identifiers()})
        if (const Identifier* identifier = find_identifier(table, name))
            found.insert(identifier->number);
    if (found.empty())
        node.fail("no attribute or statistic is named \"" + name + "\"");
    if (found.size() > 1)
        node.fail("\"" + name + "\" names several attributes; write its number");
    return *found.begin();
}

} // namespace

Fault read_fault(const Node& values) {
    values.expect_object({"function", "call", "status", "delay", "tooSmall", "missing", "absent"});
    Fault fault;
    const auto function = values.member("function");
    if (!function)
        values.fail("\"function\" is wanted");
    fault.function = function->text();
    fault.nth = values.number32("call", VLNSIM_EVERY);
    int kinds = 0;
    const auto kind = [&](std::string_view key, vlnsim_fault_kind number) {
        const auto node = values.member(key);
        if (!node)
            return;
        ++kinds;
        fault.kind = number;
        fault.value = number == VLNSIM_MISSING  ? fault_identifier(*node)
                      : number == VLNSIM_ABSENT ? node->boolean()
                                                : node->number();
    };
    kind("status", VLNSIM_STATUS);
    kind("delay", VLNSIM_DELAY);
    kind("tooSmall", VLNSIM_TOO_SMALL);
    kind("missing", VLNSIM_MISSING);
    kind("absent", VLNSIM_ABSENT);
    if (kinds != 1)
        values.fail(
            "one of \"status\", \"delay\", \"tooSmall\", \"missing\" and \"absent\" is wanted");
    const bool known = fault.kind == VLNSIM_ABSENT ? is_symbol_name(fault.function)
                                                   : is_entry_name(fault.function);
    if (!known && fault.function != "*")
        function->fail("unknown function \"" + fault.function + "\"");
    return fault;
}

namespace {

Host::File read_host_file(const Node& node) {
    node.expect_object({"path", "lines"});
    Host::File file{node.text("path", ""), {}};
    if (!file.path.starts_with("/") || file.path.find("..") != std::string::npos)
        node.fail("path is to begin with / and to have no ..");
    if (const auto lines = node.member("lines"))
        for (const Node& line : lines->items())
            file.lines.push_back(line.text());
    return file;
}

} // namespace

std::string read_file(const std::string& path) {
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path.c_str(), "rb"),
                                                               &std::fclose);
    std::string text;
    std::array<char, 4096> block{};
    if (file)
        for (std::size_t n = 0; (n = std::fread(block.data(), 1, block.size(), file.get())) > 0;)
            text.append(block.data(), n);
    if (!file || std::ferror(file.get()))
        throw Scenario_Error(path, 1, "", "cannot be read");
    return text;
}

Host read_scenario(const std::string& text, const std::string& name) {
    const Value document = with_includes(text, name, 0);
    const Scope scope;
    const Node top(document, scope);
    top.expect_object({"description", "include", "templates", "libraries", "server", "iscsiNetwork",
                       "cards", "faults", "systemLog", "files", "platform"});
    Host host;
    copy_text("simulated-host", host.server.hostName, sizeof host.server.hostName);
    copy_text("Linux 2.6 x86_64 RH", host.server.targetOS, sizeof host.server.targetOS);
    if (const auto libraries = top.member("libraries"))
        read_libraries(*libraries, host);
    if (const auto server = top.member("server"))
        read_server(*server, host);
    if (const auto network = top.member("iscsiNetwork"))
        host.iscsi_network = read_iscsi_network(*network);
    if (const auto cards = top.member("cards")) {
        Card_Reader reader(top, host);
        for (const Node& card : cards->items())
            reader.read(card);
    }
    if (const auto lines = top.member("systemLog"))
        for (const Node& line : lines->items())
            host.system_log.push_back(line.text());
    if (const auto files = top.member("files"))
        for (const Node& file : files->items())
            host.files.push_back(read_host_file(file));
    if (const auto platform = top.member("platform"))
        host.platform = beside(name, platform->text());
    if (const auto faults = top.member("faults"))
        for (const Node& fault : faults->items())
            host.faults.push_back(read_fault(fault));
    return host;
}

} // namespace vlnsim
