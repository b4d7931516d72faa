#include "foundation/log_file.h"

#include "foundation/descriptor.h"

#include <cerrno>
#include <climits>
#include <fcntl.h>
#include <string>
#include <sys/stat.h>
#include <unistd.h>

namespace cimple {

namespace {

constexpr int MAX_LINKS = 8;
constexpr mode_t RIGHTS = 0666; // less the object manager's mask

// Where our own link leads; empty for anybody else's. What is looked at is what is read, whatever
// becomes of the name meanwhile.
std::string target_of_own_link(const std::string& path) {
    const Descriptor link(open(path.c_str(), O_PATH | O_NOFOLLOW | O_CLOEXEC));
    struct stat status;
    if (!link || fstat(link.get(), &status) != 0 || status.st_uid != geteuid())
        return {};
    char target[PATH_MAX];
    const ssize_t length = readlinkat(link.get(), "", target, sizeof target);
    if (length <= 0)
        return {};
    const std::string name(target, static_cast<std::size_t>(length));
    const std::size_t folder = path.rfind('/');
    return name[0] == '/' || folder == std::string::npos ? name : path.substr(0, folder + 1) + name;
}

Descriptor open_through_own_links(std::string path) {
    for (int links = 0; links <= MAX_LINKS && !path.empty(); ++links) {
        Descriptor file(open(
            path.c_str(),
            O_RDWR | O_APPEND | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC, RIGHTS));
        if (file || errno != ELOOP)
            return file;
        path = target_of_own_link(path);
    }
    return {};
}

} // namespace

File_Handle open_log_file(const char* path) {
    Descriptor file = open_through_own_links(path);
    struct stat status;
    if (!file || fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode))
        return nullptr;
    File_Handle stream(fdopen(file.get(), "a+"));
    if (stream)
        file.release();
    return stream;
}

} // namespace cimple
