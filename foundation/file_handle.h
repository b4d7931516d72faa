// The owner of an open file.
#ifndef FOUNDATION_FILE_HANDLE_H
#define FOUNDATION_FILE_HANDLE_H

#include <cstdio>
#include <memory>

namespace cimple {

struct File_Closer {
    void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using File_Handle = std::unique_ptr<std::FILE, File_Closer>;

} // namespace cimple

#endif // FOUNDATION_FILE_HANDLE_H
