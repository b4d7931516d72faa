// Assertions and the plain trace line of the engine.
#ifndef CIMPLE_ASSERT_H
#define CIMPLE_ASSERT_H

namespace cimple {

// Prints "TRACE: file(line): text" to standard error.
void __cimple_trace(const char* file, int line, const char* text);
// Prints "file(line): function(): assert: text" to standard error and ends the process.
[[noreturn]] void __cimple_assert(const char* file, int line, const char* function,
                                  const char* text);

} // namespace cimple

// Holds in every build: what it guards would corrupt the object manager's process.
#define CIMPLE_ASSERT(condition)                                                                   \
    ((condition) ? static_cast<void>(0)                                                            \
                 : ::cimple::__cimple_assert(__FILE__, __LINE__, __func__, #condition))

#endif // CIMPLE_ASSERT_H
