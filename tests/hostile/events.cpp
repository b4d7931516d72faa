// The linker leads here what the module's own code asks of the system. An open file is a stream
// over our own functions, so that each block that is read or written is an event.
#include "tests/hostile/events.h"

#include <algorithm>
#include <cerrno>
#include <cstdarg>
#include <cstdio>
#include <mutex>
#include <new>

#include <pthread.h>
#include <semaphore.h>
#include <sys/stat.h>
#include <unistd.h>

using namespace sweep;

namespace {

Events events;

// The open streams and the files below them, without an allocation: it would be an event.
struct Open_File {
    std::FILE* stream;
    std::FILE* file;
};
constinit std::mutex files_mutex;
Open_File files[64];

// The entry of a stream, or a free one for null; null if there is none.
Open_File* find_open(const std::FILE* stream) {
    const auto found = std::find_if(std::begin(files), std::end(files),
                                    [&](const Open_File& one) { return one.stream == stream; });
    return found == std::end(files) ? nullptr : found;
}

int descriptor(void* file) {
    return fileno(static_cast<std::FILE*>(file));
}

ssize_t read_block(void* file, char* block, std::size_t size) {
    if (events.fails(READ)) {
        errno = EIO;
        return -1;
    }
    return read(descriptor(file), block, size);
}

ssize_t write_block(void* file, const char* block, std::size_t size) {
    if (events.fails(WRITE)) {
        errno = ENOSPC;
        return 0;
    }
    return write(descriptor(file), block, size);
}

int seek(void* file, off64_t* offset, int whence) {
    *offset = lseek64(descriptor(file), *offset, whence);
    return *offset < 0 ? -1 : 0;
}

int close_file(void* file) {
    {
        const std::lock_guard lock(files_mutex);
        for (Open_File& one : files)
            if (one.file == file)
                one = {};
    }
    return std::fclose(static_cast<std::FILE*>(file));
}

template <class Result>
Result refused(int error, Result result) {
    errno = error;
    return result;
}

} // namespace

Events* module_events() {
    return &events;
}

// operator new and its other forms, by the letter that size_t has in their names.
#if __SIZEOF_SIZE_T__ == 8
#define NAME(prefix, form) prefix##_Zn##form##m
#define NOTHROW(prefix, form) prefix##_Zn##form##mRKSt9nothrow_t
#else
#define NAME(prefix, form) prefix##_Zn##form##j
#define NOTHROW(prefix, form) prefix##_Zn##form##jRKSt9nothrow_t
#endif

// A wrapped function: KIND and what it answers when it fails.
#define WRAP(kind, result, name, parameters, arguments, failure)                                   \
    result __real_##name parameters;                                                               \
    result __wrap_##name parameters {                                                              \
        return events.fails(kind) ? failure : __real_##name arguments;                             \
    }

#define WRAP_NEW(form)                                                                             \
    void* NAME(__real_, form)(std::size_t);                                                        \
    void* NAME(__wrap_, form)(std::size_t size) {                                                  \
        return events.fails(ALLOCATION) ? throw std::bad_alloc() : NAME(__real_, form)(size);      \
    }                                                                                              \
    void* NOTHROW(__real_, form)(std::size_t, const std::nothrow_t&);                              \
    void* NOTHROW(__wrap_, form)(std::size_t size, const std::nothrow_t& tag) {                    \
        return events.fails(ALLOCATION) ? nullptr : NOTHROW(__real_, form)(size, tag);             \
    }

extern "C" {

WRAP_NEW(w)
WRAP_NEW(a)
WRAP(ALLOCATION, void*, malloc, (std::size_t size), (size), nullptr)
WRAP(ALLOCATION, void*, calloc, (std::size_t count, std::size_t size), (count, size), nullptr)
WRAP(ALLOCATION, void*, realloc, (void* block, std::size_t size), (block, size), nullptr)
WRAP(THREAD, int, pthread_create,
     (pthread_t * thread, const pthread_attr_t* attributes, void* (*proc)(void*), void* argument),
     (thread, attributes, proc, argument), EAGAIN)
WRAP(LINKER, void*, dlopen, (const char* name, int mode), (name, mode), nullptr)
WRAP(LINKER, void*, dlsym, (void* handle, const char* name), (handle, name), nullptr)
WRAP(OPEN, int, mkdir, (const char* path, mode_t mode), (path, mode), refused(ENOSPC, -1))
WRAP(OPEN, int, rename, (const char* from, const char* to), (from, to), refused(ENOSPC, -1))
// std::filebuf::open: what is read through it is small, and not an event.
WRAP(OPEN, void*, _ZNSt13basic_filebufIcSt11char_traitsIcEE4openEPKcSt13_Ios_Openmode,
     (void* buffer, const char* path, unsigned mode), (buffer, path, mode), nullptr)

std::FILE* __real_fopen64(const char* path, const char* mode);
std::FILE* __wrap_fopen64(const char* path, const char* mode) {
    if (events.fails(OPEN))
        return refused(EMFILE, nullptr);
    std::FILE* file = __real_fopen64(path, mode);
    if (!file)
        return nullptr;
    std::FILE* stream = fopencookie(file, mode, {read_block, write_block, seek, close_file});
    const std::lock_guard lock(files_mutex);
    if (Open_File* entry = find_open(nullptr))
        *entry = {stream, file};
    return stream;
}

int __real_fileno(std::FILE* stream);
int __wrap_fileno(std::FILE* stream) {
    const std::lock_guard lock(files_mutex);
    const Open_File* entry = find_open(stream);
    return __real_fileno(entry ? entry->file : stream);
}

int __real_open64(const char* path, int flags, ...);
int __wrap_open64(const char* path, int flags, ...) {
    std::va_list arguments;
    va_start(arguments, flags);
    const unsigned mode = va_arg(arguments, unsigned);
    va_end(arguments);
    return events.fails(OPEN) ? refused(EMFILE, -1) : __real_open64(path, flags, mode);
}

sem_t* __real_sem_open(const char* name, int flags, ...);
sem_t* __wrap_sem_open(const char* name, int flags, ...) {
    std::va_list arguments;
    va_start(arguments, flags);
    const unsigned mode = va_arg(arguments, unsigned);
    const unsigned value = va_arg(arguments, unsigned);
    va_end(arguments);
    return events.fails(OPEN) ? refused(ENOSPC, SEM_FAILED)
                              : __real_sem_open(name, flags, mode, value);
}
}
