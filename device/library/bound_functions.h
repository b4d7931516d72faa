// The bound functions: one function per entry point of the closed libraries, with the entry point's
// own name and signature, that finds the symbol at run time and calls it. Everything else in the
// system calls the libraries through these and through nothing else.
//
// They are declared where the libraries are (device/library/axapi.h), hidden in the module, so that
// a search of the default scope finds a library's function and never one of ours. An entry point
// that can't be reached answers its failure value, which is 1 for nearly all
// (device/library/bound_functions.inc) and null where a pointer is returned. They take no lock; any
// thread may call them after loadRuntimeLibraries.
#ifndef VLN_DEVICE_LIBRARY_BOUND_FUNCTIONS_H
#define VLN_DEVICE_LIBRARY_BOUND_FUNCTIONS_H

#include "device/library/axapi.h"

#endif // VLN_DEVICE_LIBRARY_BOUND_FUNCTIONS_H
