// libcurl, which is opened at run time where the host has it, and never linked.
#ifndef OPERATIONS_CURL_LIBRARY_H
#define OPERATIONS_CURL_LIBRARY_H

#include "device/library/runtime_loader.h"

namespace cimple {

// What we call of it, under its own names without "curl_".
struct Curl_Functions {
    int (*global_init)(long flags);
    void (*global_cleanup)();
    void* (*easy_init)();
    int (*easy_setopt)(void* handle, int option, ...);
    int (*easy_perform)(void* handle);
    void (*easy_cleanup)(void* handle);
};

// The library, open for one use and closed after it: whoever administers the host may exchange it
// between two uses.
class Curl_Library {
public:
    enum Use { LOOK_FOR, FETCH, SEND };

    explicit Curl_Library(Use use);
    ~Curl_Library() { close(); }
    Curl_Library(const Curl_Library&) = delete;
    Curl_Library& operator=(const Curl_Library&) = delete;

    bool is_open() const { return m_handle != nullptr; }
    // False, after a line of the log for each, when functions are missing.
    bool bind(Curl_Functions& functions) const;
    // False when the dynamic linker refuses.
    bool close();

private:
    void* m_handle = nullptr;
};

// Whether the host has libcurl.
bool curl_is_present();

// For tests, which must not see the machine's libcurl: null puts the dynamic linker back.
void replace_curl_loader(const Loader_Calls* calls);

} // namespace cimple

#endif // OPERATIONS_CURL_LIBRARY_H
