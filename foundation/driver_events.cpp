#include "foundation/driver_events.h"

#include "foundation/descriptor.h"
#include "foundation/host_paths.h"
#include "foundation/log.h"
#include "foundation/utf8.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <deque>
#include <fcntl.h>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <vector>

namespace cimple {

namespace {

constexpr std::size_t BLOCK = 65536;

std::string shown(std::string_view line) {
    std::string text = to_utf8(line);
    constexpr std::string_view REPLACEMENT = "\xEF\xBF\xBD"; // U+FFFD
    for (std::size_t at = 0; (at = text.find('\0', at)) != std::string::npos;)
        text.replace(at, 1, REPLACEMENT);
    return text;
}

// The newest lines of one driver.
class Newest_Lines {
public:
    explicit Newest_Lines(const Driver_Events& driver)
        : _driver(driver), _key_length(std::strlen(driver.key_word)) {}

    void look_at(std::string_view line) {
        if (!memmem(line.data(), line.size(), _driver.key_word, _key_length))
            return;
        _lines.emplace_back(line);
        _size += line.size();
        while (_lines.size() > _driver.log->maximum() || _size > MAX_EVENT_TEXT) {
            _size -= _lines.front().size();
            _lines.pop_front();
        }
    }

    // Only what is handed over is made text, which takes longer than to read: a log may consist of
    // lines of the driver. A line is here or there, so that both together need little memory.
    void hand_over() {
        std::size_t room = MAX_EVENT_TEXT;
        for (; !_lines.empty(); _lines.pop_back()) {
            std::string text = shown(_lines.back());
            if (text.size() > room)
                break;
            room -= text.size();
            if (_driver.log->Handlelog(std::move(text)) != 0)
                break;
        }
        _lines.clear();
        VLN_LOG(VLN_DBG, "Finished reading Events for %s", _driver.key_word);
    }

private:
    const Driver_Events& _driver;
    std::size_t _key_length;
    std::deque<std::string> _lines;
    std::size_t _size = 0;
};

// A file's lines, in a buffer that holds the longest one and a block behind it.
class Line_Reader {
public:
    explicit Line_Reader(const std::string& path)
        : _file(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_NOCTTY | O_CLOEXEC)) {
        struct stat status;
        if (_file && fstat(_file.get(), &status) == 0 && S_ISREG(status.st_mode))
            _left = static_cast<uint64>(status.st_size);
        else
            _file = Descriptor();
    }

    bool is_open() const { return static_cast<bool>(_file); }

    template <class Visit>
    void each_line(Visit visit) {
        _buffer.resize(MAX_EVENT_LINE + BLOCK);
        while (fill()) {
            while (const char* end = line_end())
                finish_line(end, visit);
            cut_long_line(visit);
        }
        if (_end != _begin && !_cut)
            visit(std::string_view(at(_begin), _end - _begin));
    }

private:
    const char* at(std::size_t place) const { return _buffer.data() + place; }

    const char* line_end() const {
        return static_cast<const char*>(std::memchr(at(_looked_at), '\n', _end - _looked_at));
    }

    template <class Visit>
    void finish_line(const char* end, Visit& visit) {
        const std::string_view line(at(_begin), static_cast<std::size_t>(end - at(_begin)));
        if (!_cut)
            visit(utf8_prefix(line, MAX_EVENT_LINE));
        _cut = false;
        _begin = _looked_at = static_cast<std::size_t>(end - _buffer.data()) + 1;
    }

    template <class Visit>
    void cut_long_line(Visit& visit) {
        _looked_at = _end;
        if (!_cut && _end - _begin <= MAX_EVENT_LINE)
            return;
        if (!_cut)
            visit(utf8_prefix(std::string_view(at(_begin), _end - _begin), MAX_EVENT_LINE));
        _cut = true;
        _begin = _end;
    }

    // False at the end. A file that grows is not followed, one that shrinks ends where it does.
    bool fill() {
        std::copy(at(_begin), at(_end), _buffer.data());
        _end -= _begin;
        _looked_at -= _begin;
        _begin = 0;
        const auto wanted =
            static_cast<std::size_t>(std::min<uint64>(_left, _buffer.size() - _end));
        ssize_t count = 0;
        do
            count = wanted == 0 ? 0 : read(_file.get(), _buffer.data() + _end, wanted);
        while (count < 0 && errno == EINTR);
        if (count <= 0)
            return false;
        _end += static_cast<std::size_t>(count);
        _left -= static_cast<uint64>(count);
        return true;
    }

    Descriptor _file;
    uint64 _left = 0; // of the file, not yet read
    std::vector<char> _buffer;
    std::size_t _begin = 0, _looked_at = 0, _end = 0; // of the line at work, and of what is read
    bool _cut = false; // the line at work has been told as far as it is long enough
};

} // namespace

void ReadDriverEvents(std::span<const Driver_Events> drivers) {
    for (const Driver_Events& driver : drivers)
        VLN_LOG(VLN_DBG, "Reading Events for %s", driver.key_word);
    Line_Reader reader(host_path(Host_File::SYSTEM_LOG));
    if (!reader.is_open())
        return;
    std::vector<Newest_Lines> newest(drivers.begin(), drivers.end());
    reader.each_line([&newest](std::string_view line) {
        for (Newest_Lines& lines : newest)
            lines.look_at(line);
    });
    for (Newest_Lines& lines : newest)
        lines.hand_over();
}

} // namespace cimple
