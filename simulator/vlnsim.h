/* Control interface of the simulated management libraries.
 *
 * libvlnsim.so holds one simulated host per process: its adapters, the state that the libraries
 * change, a script of faults, the counts and records of calls, and a clock. liblaxapi.so,
 * libaxapi.so and libHBAAPI.so.2, in the folder "libraries" beside it, are the faces that the
 * provider sees; they contain nothing of their own.
 *
 * In process: load a scenario, call vlnsim_open_libraries(), then load the provider: its dlopen()
 * of a bare file name is satisfied by a library of that SONAME which is loaded already. In a child
 * process: put that folder on the library path and name a scenario in the environment variable
 * VLNSIM_SCENARIO; it is read at the first use of a library, unless a scenario was loaded before.
 * The module built for simulation does it by itself: where no scenario was loaded before, it takes
 * the environment's when it is loaded, with vlnsim_use_environment().
 *
 * Every function may be called by any thread at any time. Texts are UTF-8 and NUL-terminated.
 * Functions that fill a text buffer always terminate it and cut what does not fit. Nothing here
 * throws.
 */
#ifndef VLNSIM_H
#define VLNSIM_H

#include <stddef.h>
#include <stdint.h>
#include <stdio.h>

#ifdef __cplusplus
extern "C" {
#endif

#define VLNSIM_API __attribute__((visibility("default")))

/* ---- Scenario ----------------------------------------------------------------------------------
 */

/* Replaces the simulated host by the one that the file describes; the fault script, counts,
 * recorded calls and violations start afresh; clock, host root and trace stream stay. Returns 0, or
 * 1 with "file:line: path/in/json: what is wrong" in error, and then the host stays as it was.
 * error may be null. */
VLNSIM_API int vlnsim_load_scenario(const char* path, char* error, size_t size);

/* The same from a text; name stands for the file in messages. */
VLNSIM_API int vlnsim_load_scenario_text(const char* text, const char* name, char* error,
                                         size_t size);

/* Loads the same scenario again, so that what calls have changed is forgotten. */
VLNSIM_API void vlnsim_restart(void);

/* Back to the state after loading this library: a host without adapters, all libraries present, the
 * system's clock, no host root, no trace. The libraries opened stay open. */
VLNSIM_API void vlnsim_reset(void);

/* Changes one value of the running host, as hardware would. wwn is the port WWN of the function as
 * 16 hexadecimal digits; table is "adapterAttributes", "portAttributes", "statistics" or
 * "features"; name as in a scenario, by name or number; value is a JSON text, null to make the
 * value missing. The table may also be "driverParameters" or "globalDriverParameters", for the
 * current value of the parameter of that name, or "diagnostics". Returns 0, or 1 with a text in
 * error. */
VLNSIM_API int vlnsim_set_value(const char* wwn, const char* table, const char* name,
                                const char* value, char* error, size_t size);

/* Writes to a file what of the running host's state differs from its scenario, so that another
 * process can go on with it: attributes, statistics, features, driver parameters and the records
 * that calls set. Returns 0, or 1 with a text in error. */
VLNSIM_API int vlnsim_save_state(const char* path, char* error, size_t size);

/* Lays such a file over the host of the same scenario. Returns 0, or 1 with "file:line:
 * path/in/json: what is wrong" in error, and then the host stays as it was. */
VLNSIM_API int vlnsim_load_state(const char* path, char* error, size_t size);

/* The file with what is the platform's own on the host, as its scenario names it, or "". Stays valid
 * until another scenario is loaded. */
VLNSIM_API const char* vlnsim_platform(void);

/* Starts the host anew: what changes with a reboot, firmware on flash for one, comes into force.
 * The provider sees it with its next refresh. */
VLNSIM_API void vlnsim_reboot(void);

/* What is done to an adapter or a port of the running host from outside: a reset of the adapter, as
 * its library would do; the cable of the physical port pulled, and plugged in again. wwn as for
 * vlnsim_set_value. Returns 0, or 1 with a text in error. */
enum vlnsim_action { VLNSIM_RESET_ADAPTER = 0, VLNSIM_PULL_CABLE = 1, VLNSIM_PLUG_CABLE = 2 };
VLNSIM_API int vlnsim_act(const char* wwn, enum vlnsim_action action, char* error, size_t size);

/* Writes a line behind the last one of the host's log, /var/log/messages below the host root.
 * Returns 0, or 1 if it cannot be written, and without a host root. */
VLNSIM_API int vlnsim_log(const char* line);

/* Writes a firmware image for adapters of the model, with size bytes behind its head. Returns 0, or
 * 1 with a text in error. */
VLNSIM_API int vlnsim_write_firmware(const char* path, const char* model, const char* version,
                                     size_t size, char* error, size_t error_size);

/* ---- Libraries ---------------------------------------------------------------------------------
 */

enum vlnsim_library { VLNSIM_LOCAL = 0, VLNSIM_FALLBACK = 1, VLNSIM_HBA = 2 };

/* Whether the scenario says that the host has the library. */
VLNSIM_API int vlnsim_library_present(enum vlnsim_library library);

/* Opens those libraries that the scenario says the host has, from the folder "libraries" beside
 * libvlnsim.so, and keeps them open. Returns 0, or 1 with dlopen()'s text in error. */
VLNSIM_API int vlnsim_open_libraries(char* error, size_t size);

/* Unless a scenario was chosen before: makes the folder that the environment variable
 * VLNSIM_HOST_ROOT names the host root, and opens the libraries of the host of VLNSIM_SCENARIO.
 * Without that variable it is a host with all libraries and no adapter. What goes wrong is told on
 * standard error. */
VLNSIM_API void vlnsim_use_environment(void);

/* Closes what vlnsim_open_libraries opened. */
VLNSIM_API void vlnsim_close_libraries(void);

/* How often a symbol ("LAX_GetVersion", "HBA_OpenAdapter") was looked up in the libraries, found or
 * not; null for all symbols together. */
VLNSIM_API unsigned long vlnsim_lookups(const char* symbol);

/* ---- Host root and clock ------------------------------------------------------------------------
 */

/* The folder that stands for the host's "/" in a module built for simulation. Null or "": none. */
VLNSIM_API void vlnsim_set_host_root(const char* folder);

/* The same, with the folders in it that the module writes to; what is missing is made. Returns 0,
 * or 1 with a text in error, and then the root stays as it was. */
VLNSIM_API int vlnsim_make_host_root(const char* folder, char* error, size_t size);

/* Never null; the text stays valid until the process ends. */
VLNSIM_API const char* vlnsim_host_root(void);

/* From now on time stands still but for vlnsim_advance and vlnsim_sleep. Microseconds since the
 * epoch. */
VLNSIM_API void vlnsim_use_virtual_clock(uint64_t start_usec);
VLNSIM_API void vlnsim_use_system_clock(void);
/* The system's clock, but a sleep returns at once and the clock is ahead by so much from then on:
 * for people, who would wait otherwise. */
VLNSIM_API void vlnsim_skip_sleeps(void);
VLNSIM_API void vlnsim_advance(uint64_t usec); /* no effect on the system's clock */
VLNSIM_API uint64_t vlnsim_now(void);
VLNSIM_API void
vlnsim_sleep(uint64_t usec); /* a virtual clock advances and the call returns at once */

/* A sleep that waits for the clock, a virtual one as well: until others have advanced it to the end
 * of the span, or until stopped(context) is not 0, which is asked at the start and at each
 * vlnsim_wake, under the clock's lock. A change of the clock ends it. */
VLNSIM_API void vlnsim_pause(uint64_t usec, int (*stopped)(const void* context),
                             const void* context);
VLNSIM_API void vlnsim_wake(void);
/* Threads in a pause whose end has not come; on the system's clock, in any pause. */
VLNSIM_API size_t vlnsim_paused(void);

/* ---- Network interfaces
 * --------------------------------------------------------------------------
 */

/* The simulated host's name, as gethostname(2): 0, or -1 for a host without one. */
VLNSIM_API int vlnsim_host_name(char* name, size_t size);

/* The IPv4 address of the host of that name, which is the simulated one alone. Returns 0, or 1 if
 * the name cannot be resolved. */
VLNSIM_API int vlnsim_resolve_host(const char* name, char* address, size_t size);

/* What the simulated host's kernel knows of an interface. */
struct vlnsim_interface {
    int up;           /* the port's functional state is 2 */
    int family;       /* AF_INET, AF_INET6, 0 without an address */
    char address[64]; /* attributes IPv4Address and SubnetMask, as texts */
    char mask[64];
};

/* The interface is that of the first function with the port attribute IPProtocolEndpointName of
 * that value. Returns 0, or 1 if there is none. */
VLNSIM_API int vlnsim_find_interface(const char* name, struct vlnsim_interface* found);

/* ---- Faults
 * -------------------------------------------------------------------------------------- */

enum vlnsim_fault_kind {
    VLNSIM_STATUS = 0, /* value: the status answered; the call changes nothing else */
    VLNSIM_DELAY = 1,  /* value: microseconds, slept on the clock above before the call */
    VLNSIM_TOO_SMALL =
        2, /* the buffer counts as too small; value: the needed count, 0: the true one */
    VLNSIM_MISSING = 3, /* value: the identifier that AX_GetAttributeValue does not find, 0: any */
    VLNSIM_ABSENT = 4,  /* the symbol is not exported; nth is ignored, and function may also be the
                           name of one symbol, such as "LAX_GetVPDV2" */
    VLNSIM_HOLD = 5     /* the call stands still, before it does anything, until the rules are
                           cleared; value is ignored */
};

#define VLNSIM_EVERY 0u

/* Adds a rule: the nth call of the function from now on (1 is the next) or VLNSIM_EVERY call fails
 * as told. function is the name of a bound function ("AX_GetHBAAttributes", "HBA_OpenAdapter"), or
 * "*" for any. The first rule that fits is taken; a delay goes with any other rule. Returns 0, or 1
 * for an unknown function or kind. */
VLNSIM_API int vlnsim_fault(const char* function, unsigned nth, enum vlnsim_fault_kind kind,
                            uint64_t value);
/* Lets the calls go that a rule holds, as does whatever replaces the host. */
VLNSIM_API void vlnsim_clear_faults(void);
/* Calls that stand still. */
VLNSIM_API size_t vlnsim_held(void);

/* ---- What was called
 * ------------------------------------------------------------------------------ */

/* Calls of a function since the scenario was loaded or vlnsim_clear_calls; null: of all functions.
 */
VLNSIM_API unsigned long vlnsim_calls(const char* function);

/* Calls visit for each function called at least once, in alphabetical order. */
VLNSIM_API void vlnsim_each_call(void (*visit)(void* context, const char* function,
                                               unsigned long count),
                                 void* context);

/* Zeroes the counts, the lookups and the recorded calls. */
VLNSIM_API void vlnsim_clear_calls(void);

/* Writes a line for each call from now on: "AX_GetHBAFeature(10000090FA000001, 201) = 0 value=1".
 * Null ends it. The stream must stay open until then. */
VLNSIM_API void vlnsim_trace(FILE* stream);

/* Keeps the same lines in memory while on. */
VLNSIM_API void vlnsim_record_calls(int on);
VLNSIM_API size_t vlnsim_recorded_calls(void);
VLNSIM_API int vlnsim_recorded_call(size_t index, char* text,
                                    size_t size); /* 0, or 1: no such line */

/* Breaches of the libraries' contract by the caller: null pointers, sizes that cannot be right,
 * unknown WWNs and handles, calls before AX_InitLib, a guard behind a buffer that was overwritten.
 */
VLNSIM_API size_t vlnsim_violations(void);
VLNSIM_API int vlnsim_violation(size_t index, char* text, size_t size); /* 0, or 1: no such line */

/* HBA API handles that were opened and not closed. */
VLNSIM_API size_t vlnsim_open_handles(void);

#ifdef __cplusplus
}
#endif

#endif /* VLNSIM_H */
