// What the programs of the measurements share: a simulated host, and the bench module's hooks.
#ifndef BENCH_BENCH_PROGRAM_H
#define BENCH_BENCH_PROGRAM_H

#include <string>

// Ends the program with the text as its reason.
[[noreturn]] void fail(const std::string& text);

std::string read_scenario(const char* name); // the text of a file of the scenarios

std::string one_target(unsigned volumes); // a scenario with volumes alone

// The process is a host with that scenario, in a fresh folder and on a virtual clock.
void simulate(const std::string& scenario_text);

unsigned long resident_kilobytes();

void* find_hook(const char* name);

// A hook of the bench module, which must be loaded.
template <class Function>
Function hook(const char* name) {
    return reinterpret_cast<Function>(find_hook(name));
}

#endif // BENCH_BENCH_PROGRAM_H
