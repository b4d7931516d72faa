// What the programs of the measurements share: a simulated host, and the bench module's hooks.
#ifndef BENCH_BENCH_PROGRAM_H
#define BENCH_BENCH_PROGRAM_H

#include <string>

// Ends the program with the text as its reason.
[[noreturn]] void fail(const std::string& text);

std::string read_scenario(const char* name); // the text of a file of the scenarios

bool has_scenario(const char* name);
// A scenario with another text at one place.
std::string changed_scenario(const char* name, const std::string& as_it_is,
                             const std::string& wanted);

std::string one_target(unsigned volumes); // a scenario with volumes alone
std::string san_of(unsigned units); // san-4096-luns with so many, a multiple of its 16 targets

// The process is a host with that scenario, in a fresh folder and on a virtual clock.
void simulate(const std::string& scenario_text);

unsigned long resident_kilobytes();
// Without what is mapped from files: that depends on what else the machine has in its memory.
unsigned long resident_anonymous_kilobytes();

void* find_hook(const char* name);

// A hook of the bench module, which must be loaded.
template <class Function>
Function hook(const char* name) {
    return reinterpret_cast<Function>(find_hook(name));
}

#endif // BENCH_BENCH_PROGRAM_H
