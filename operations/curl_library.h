// libcurl, which is opened at run time where the host has it, and never linked.
#ifndef OPERATIONS_CURL_LIBRARY_H
#define OPERATIONS_CURL_LIBRARY_H

#include "device/library/runtime_loader.h"

namespace cimple {

// Whether the host has libcurl: opens it under one of its names and closes it again.
bool curl_is_present();

// For tests, which must not see the machine's libcurl: null puts the dynamic linker back.
void replace_curl_loader(const Loader_Calls* calls);

} // namespace cimple

#endif // OPERATIONS_CURL_LIBRARY_H
