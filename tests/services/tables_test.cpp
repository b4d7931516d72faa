// Plays the tables of the services: each test is a client that does one row after the other to a
// host of its own, and compares what it is answered, what the log says meanwhile and what is shown.
//
//     call INSTANCE METHOD INPUT=VALUE... -> 32968 OUTPUT=TEXT   returns 0 without an arrow
//     change INSTANCE PROPERTY=VALUE... -> FAILED                OK without an arrow; of the
//     create CLASS PROPERTY=VALUE... -> FAILED                       names of statuses, what
//     delete INSTANCE -> NOT_FOUND                                   tells them apart
//     get INSTANCE -> NOT_FOUND
//     refresh                       the data are too old: new ones
//     look CLASS                    there are instances
//     show INSTANCE PROPERTY=TEXT   what is shown, as text_of gives it
//     list CLASS PROPERTY -> TEXTS  of all instances
//     count CLASS -> 3              instances
//     walk INSTANCE ASSOCIATION -> 2
//     log -> 1 | LINE               as often in the whole log
//     calls FUNCTION -> 1           of the library
//     set WWN TABLE NAME VALUE      of the running host
//     fault FUNCTION STATUS [NTH]   from now on, until "clear"
//     write FILE TEXT, move FILE FILE   below the host's root
//     image FILE MODEL VERSION, cut FILE SIZE, there FILE -> yes
//     happens LINE                  to the host's log
//     hold FUNCTION, held           its next call stands still, until "clear"; and now it does
//     meanwhile ROW, begin, join    another client is to do it; all such begin; they are done
//     wait                          for a refresh that something else has asked for
//     until INSTANCE                is there, after as many refreshes as that takes
//     advance SECONDS, reboot, forget (the calls that were counted)
//
// Behind the first seven, lines stand that are logged meanwhile; "~ " before one: that are not; and
// at the end "> ": that tells a call of the library, "< ": that is printed. Among their words,
// !FUNCTION=STATUS has the function's next call fail, !FUNCTION=STATUS@2 the one after it. Values
// are as on mpcactl's command line, and instances as road::instance_of has them.
#include "tests/hostile/sudden_ends.h"
#include "tests/road/properties.h"
#include "tests/services/table_text.h"
#include "tools/mpcactl/assignment.h"

#include <cmath>
#include <fstream>

using road::Road;
using services::Row;
using services::Table;

namespace {

std::string joined(const std::vector<std::string>& words) {
    std::string text;
    for (const std::string& word : words)
        text += (text.empty() ? "" : " ") + word;
    return text;
}

// "CMPI_RC_ERR_FAILED" is FAILED.
std::string word_of(const host::Status& status) {
    const std::string name = host::rc_name(status.rc).substr(std::string("CMPI_RC_").size());
    return name.starts_with("ERR_") ? name.substr(4) : name;
}

struct Answer {
    std::string word;
    host::Named_Values outputs = {};
};
using Operation = std::function<Answer()>;

class Player {
public:
    explicit Player(const std::string& host) : _road({.scenario = host, .log = true}) {}

    void play(const Row& row) {
        SCOPED_TRACE(row.place + ": " + row.verb + " " + joined(row.words));
        try {
            if (!prepare(row))
                look(row);
        } catch (const std::exception& error) {
            ADD_FAILURE() << error.what();
        }
    }

private:
    const std::string& word(const Row& row, std::size_t i) { return row.words.at(i); }

    // What begins before the host's first look at its adapters, and what it needs not be asked for.
    bool prepare(const Row& row) {
        if (row.verb == "set") {
            road::set_value(word(row, 0).c_str(), word(row, 1).c_str(), word(row, 2).c_str(),
                            word(row, 3).c_str());
            return true;
        }
        if (row.verb == "fault") {
            vlnsim_fault(word(row, 0).c_str(),
                         row.words.size() > 2 ? static_cast<unsigned>(std::stoul(word(row, 2))) : 0,
                         VLNSIM_STATUS, std::stoul(word(row, 1)));
            return true;
        }
        if (_refreshes == 0) {
            _road.enumerate("VLNMPCA_Card");
            _road.wait_for_refreshes(++_refreshes);
        }
        if (row.verb == "write")
            std::ofstream(_road.root() / word(row, 0)) << word(row, 1);
        else if (row.verb == "move")
            std::filesystem::rename(_road.root() / word(row, 0), _road.root() / word(row, 1));
        else if (row.verb == "cut")
            std::filesystem::resize_file(_road.root() / word(row, 0), std::stoul(word(row, 1)));
        else if (row.verb == "image")
            write_image(_road.root() / word(row, 0), word(row, 1), word(row, 2));
        else if (row.verb == "happens")
            vlnsim_log(joined(row.words).c_str());
        else if (row.verb == "clear")
            end_hold();
        else if (row.verb == "reboot")
            vlnsim_reboot();
        else if (row.verb == "forget")
            vlnsim_clear_calls();
        else if (row.verb == "hold")
            begin_hold(word(row, 0).c_str());
        else if (row.verb == "held")
            sudden_ends::wait_until_held();
        else if (row.verb == "meanwhile")
            prepare_client(row);
        else if (row.verb == "begin")
            begin();
        else if (row.verb == "join")
            join();
        else if (row.verb == "wait")
            _road.wait_for_refreshes(++_refreshes);
        else if (row.verb == "until")
            wait_until_there(word(row, 0));
        else if (row.verb == "advance")
            vlnsim_advance(static_cast<std::uint64_t>(std::llround(std::stod(word(row, 0)) * 1e6)));
        else
            return false;
        return true;
    }

    // By whichever refresh shows it: the provider may have started some of its own.
    void wait_until_there(const std::string& name) {
        while (true) {
            try {
                road::instance_of(_road, name);
                return;
            } catch (const std::runtime_error&) {
                vlnsim_advance(sudden_ends::STALE);
            }
        }
    }

    static void write_image(const std::string& path, const std::string& model,
                            const std::string& version) {
        constexpr std::size_t SIZE = 1000;
        char error[256] = "";
        EXPECT_EQ(vlnsim_write_firmware(path.c_str(), model.c_str(), version.c_str(), SIZE, error,
                                        sizeof error),
                  0)
            << error;
    }

    void look(const Row& row) {
        const std::string answer = joined(row.answer);
        if (row.verb == "show")
            expect_properties(road::instance_of(_road, word(row, 0)), row.words, 1);
        else if (row.verb == "count")
            EXPECT_EQ(std::to_string(_road.enumerate(word(row, 0)).size()), answer);
        else if (row.verb == "list")
            EXPECT_EQ(texts_of(word(row, 0), word(row, 1)), answer);
        else if (row.verb == "walk")
            EXPECT_EQ(std::to_string(road::walk(_road, road::instance_of(_road, word(row, 0)),
                                                word(row, 1).c_str())
                                         .size()),
                      answer);
        else if (row.verb == "log")
            EXPECT_EQ(std::to_string(_road.count_in_log(row.lines.at(0))), answer)
                << row.lines.at(0);
        else if (row.verb == "there")
            EXPECT_EQ(std::filesystem::exists(_road.root() / word(row, 0)) ? "yes" : "no", answer);
        else if (row.verb == "calls")
            EXPECT_EQ(std::to_string(vlnsim_calls(word(row, 0).c_str())), answer);
        else
            operate(row);
    }

    // Of a property, or of an element, "PROPERTY[2]".
    static std::string shown(host::Instance instance, const std::string& name) {
        const std::size_t bracket = name.find('[');
        const host::Value* list = instance.property(name.substr(0, bracket));
        if (bracket == name.npos || !list)
            return road::text_of(instance, name);
        const host::Value element = list->as_array().at(std::stoul(name.substr(bracket + 1)));
        host::set(instance.properties, name, element);
        return road::text_of(instance, name);
    }

    static void expect_properties(const host::Instance& instance,
                                  const std::vector<std::string>& texts, std::size_t from) {
        for (std::size_t i = from; i < texts.size(); ++i) {
            const std::size_t equals = texts[i].find('=');
            EXPECT_EQ(shown(instance, texts[i].substr(0, equals)), texts[i].substr(equals + 1))
                << texts[i];
        }
    }

    std::string texts_of(const std::string& class_name, const std::string& property) {
        std::vector<std::string> texts;
        for (const host::Instance& each : _road.enumerate(class_name))
            texts.push_back(road::text_of(each, property));
        return joined(texts);
    }

    // ---- What changes something, or may ----

    void operate(const Row& row) {
        const Operation make = operation(row);
        settle();
        const std::string last = row.lines.empty() ? "" : row.lines.back();
        const bool is_recorded = last.starts_with("> "), is_printed = last.starts_with("< ");
        const bool is_armed = arm(row);
        const std::size_t before = _road.log_text().size();
        vlnsim_record_calls(is_recorded);
        if (is_printed)
            testing::internal::CaptureStdout();
        const Answer answer = make();
        _printed = is_printed ? testing::internal::GetCapturedStdout() : "";
        vlnsim_record_calls(0);
        expect_answer(row, answer, before);
        if (is_armed)
            vlnsim_clear_faults();
        if (is_recorded)
            vlnsim_clear_calls();
    }

    void expect_answer(const Row& row, const Answer& answer, std::size_t before) {
        const std::string log = _road.log_text().substr(before);
        EXPECT_EQ(answer.word, row.is_answered      ? row.answer.at(0)
                               : row.verb == "call" ? "0"
                                                    : "OK")
            << log;
        host::Instance outputs;
        outputs.properties = answer.outputs;
        expect_properties(outputs, row.answer, row.is_answered);
        for (const std::string& line : row.lines)
            expect_line(line, log);
    }

    // What the operation needs is found now: nobody may be able to ask when it begins.
    void prepare_client(Row row) {
        row.verb = word(row, 0);
        row.words.erase(row.words.begin());
        _prepared.emplace_back([=, this, make = operation(row)] {
            SCOPED_TRACE(row.place);
            const std::size_t before = _road.log_text().size();
            const Answer answer = make();
            expect_answer(row, answer, before);
        });
    }

    void begin_hold(const char* function) {
        _is_held = true;
        sudden_ends::hold(function);
    }

    void end_hold() {
        _is_held = false;
        vlnsim_clear_faults();
    }

    void begin() {
        for (std::function<void()>& client : _prepared)
            _clients.emplace_back(std::move(client));
        _prepared.clear();
    }

    void join() {
        for (std::thread& client : _clients)
            client.join();
        _clients.clear();
    }

    // The words that give a value.
    std::vector<std::string> values_of(const Row& row, std::size_t from) {
        std::vector<std::string> values;
        for (std::size_t i = from; i < row.words.size(); ++i)
            if (!row.words[i].starts_with('!'))
                values.push_back(road::filled_in(_road, row.words[i]));
        return values;
    }

    static bool arm(const Row& row) {
        bool is_armed = false;
        for (const std::string& each : row.words) {
            if (!each.starts_with('!'))
                continue;
            const std::size_t equals = each.find('='), at = each.find('@');
            const unsigned long nth = at == each.npos ? 1 : std::stoul(each.substr(at + 1));
            vlnsim_fault(each.substr(1, equals - 1).c_str(), static_cast<unsigned>(nth),
                         VLNSIM_STATUS, std::stoul(each.substr(equals + 1)));
            is_armed = true;
        }
        return is_armed;
    }

    Operation operation(const Row& row) {
        host::Manager& manager = _road.manager();
        const host::ClassRepository& classes = manager.classes();
        if (row.verb == "refresh")
            return [this] { return refresh(); };
        if (row.verb == "look")
            return [this, name = word(row, 0)] {
                return Answer{_road.enumerate(name).empty() ? "nothing" : "OK"};
            };
        host::Instance instance;
        if (row.verb == "create")
            instance.path.class_name = word(row, 0);
        else
            instance = road::instance_of(_road, word(row, 0));
        const host::Class& known = *classes.find(instance.path.class_name);
        if (row.verb == "get")
            return
                [&manager, instance] { return Answer{word_of(manager.get(instance.path).status)}; };
        if (row.verb == "delete")
            return [&manager, instance] { return Answer{word_of(manager.remove(instance.path))}; };
        if (row.verb == "call") {
            const host::Method* method = known.find_method(word(row, 1));
            if (!method)
                throw std::runtime_error("no method " + word(row, 1));
            const auto inputs =
                mpcactl::read_inputs(classes, *method, values_of(row, 2), "root/vorlan");
            return [=, this] { return called(instance.path, method->name, inputs); };
        }
        const bool is_created = row.verb == "create";
        if (!is_created && row.verb != "change")
            throw std::runtime_error("no verb");
        std::vector<std::string> names;
        for (const host::Named_Value& each :
             mpcactl::read_properties(classes, known, values_of(row, 1), "root/vorlan")) {
            host::set(instance.properties, each.name, each.value);
            names.push_back(each.name);
        }
        return [=, &manager] {
            return Answer{word_of(is_created ? manager.create(instance).status
                                             : manager.modify(instance, names))};
        };
    }

    Answer called(const host::ObjectPath& path, const std::string& method,
                  const host::Named_Values& inputs) {
        const auto reply = _road.manager().invoke(path, method, inputs);
        return {reply.ok() ? std::to_string(reply.value.value.as_unsigned())
                           : word_of(reply.status),
                reply.value.outputs};
    }

    // A refresh that a change has asked for comes first: it need not bring new data of all.
    Answer refresh() {
        for (const std::uint64_t time : {std::uint64_t{0}, sudden_ends::STALE}) {
            vlnsim_advance(time);
            _road.enumerate("VLNMPCA_Card"); // starts it, and may see it already
            settle();
        }
        return {"OK"};
    }

    // Until no refresh is on its way any more: it would meet the failures that are meant for
    // others.
    void settle() {
        if (_is_held)
            return;
        _refreshes = _road.count_in_log("---Created DataFetch_Handler thread");
        _road.wait_for_refreshes(_refreshes);
    }

    void expect_line(const std::string& line, const std::string& log) {
        if (line.starts_with("~ ")) {
            EXPECT_EQ(log.find(line.substr(2)), std::string::npos) << line;
        } else if (line.starts_with("< ")) {
            EXPECT_NE(_printed.find(line.substr(2)), std::string::npos) << line << _printed;
        } else if (line.starts_with("> ")) {
            std::string calls;
            char text[512] = "";
            for (std::size_t i = 0; vlnsim_recorded_call(i, text, sizeof text) == 0; ++i)
                calls += std::string(text) + "\n";
            EXPECT_NE(calls.find(line.substr(2)), std::string::npos) << line << "\n" << calls;
        } else {
            EXPECT_NE(log.find(line), std::string::npos) << line << "\n" << log;
        }
    }

    Road _road;
    std::size_t _refreshes = 0;
    bool _is_held = false; // a call of the library, until "clear"
    std::string _printed;  // by the operation before
    std::vector<std::function<void()>> _prepared;
    std::vector<std::thread> _clients;
};

class Tables : public testing::TestWithParam<Table> {};

TEST_P(Tables, ArePlayed) {
    Player player(GetParam().host);
    for (const Row& row : GetParam().rows)
        player.play(row);
}

INSTANTIATE_TEST_SUITE_P(Services, Tables, testing::ValuesIn(services::read_tables(VLN_TABLES)),
                         [](const auto& info) { return info.param.name; });

} // namespace
