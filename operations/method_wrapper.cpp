#include "operations/method_wrapper.h"

#include "device/library/bound_functions.h"
#include "foundation/log.h"

#include <cerrno>
#include <cstdio>
#include <exception>
#include <fcntl.h>
#include <mutex>
#include <semaphore.h>
#include <unistd.h>

namespace cimple {

static_assert(sizeof(VLN_MethodWrapper) == 1, "the object has no data members");

namespace {

// The semaphore of the handshake; null outside a wrapper's lifetime. It starts at INITIALISER: who
// finds that value is the first and initialises. The second, s_initialised, is only created.
constinit std::atomic<sem_t*> s_initialising{nullptr};
constinit std::atomic<sem_t*> s_initialised{nullptr};

// Guards the step from "nobody in this process has the semaphore" to "somebody has".
constinit std::mutex s_openMutex;

constexpr int INITIALISER = 2;
constexpr mode_t SEMAPHORE_MODE = 0644;

// The names carry the process identifier, so that the handshake guards one process.
struct Semaphore_Name {
    char text[48];

    explicit Semaphore_Name(const char* prefix) {
        std::snprintf(text, sizeof text, "%s%d", prefix, static_cast<int>(getpid()));
    }
};

Semaphore_Name initialisingName() {
    return Semaphore_Name("/VLN_AX_INIT_LIB_");
}

Semaphore_Name initialisedName() {
    return Semaphore_Name("/VLN_AX_INIT_LIB_DONE_");
}

sem_t* createSemaphore(const Semaphore_Name& name, unsigned value) {
    sem_t* semaphore = sem_open(name.text, O_CREAT, SEMAPHORE_MODE, value);
    return semaphore == SEM_FAILED ? nullptr : semaphore;
}

// No time-out: the library's initialisation may take as long as the adapters do. A signal that the
// object manager handles on this thread does not end the wait.
void waitFor(sem_t* semaphore) {
    while (sem_wait(semaphore) == -1 && errno == EINTR) {
    }
}

int valueOf(sem_t* semaphore) {
    int value = 0;
    sem_getvalue(semaphore, &value);
    return value;
}

void unlinkNames() {
    sem_unlink(initialisingName().text);
    sem_unlink(initialisedName().text);
}

// Both semaphores of the handshake; the second may have failed to open.
void closeAndUnlink(sem_t* semaphore) {
    sem_close(semaphore);
    if (sem_t* done = s_initialised.exchange(nullptr))
        sem_close(done);
    unlinkNames();
}

// Names that are there while nobody in this process has the semaphore were left by an earlier
// process with the same identifier. Their value tells nothing, and their layout may be that of the
// other word size.
sem_t* openSemaphore(const Semaphore_Name& name) {
    const std::lock_guard lock(s_openMutex);
    if (!s_initialising)
        unlinkNames();
    sem_t* semaphore = createSemaphore(name, INITIALISER);
    s_initialising = semaphore;
    return semaphore;
}

// Throws when the library refuses.
void initialiseLibrary(sem_t* semaphore) {
    VLN_LOG(VLN_DBG, "Aquired Semaphore.. Running AX_InitLib %s ", initialisingName().text);
    // Nothing waits on the second semaphore, and nothing posts it.
    const Semaphore_Name doneName = initialisedName();
    s_initialised = createSemaphore(doneName, 0);
    VLN_LOG(VLN_DBG, "Aquired Completed Semaphore.. Running AX_InitLib %s", doneName.text);
    const auto status = static_cast<sint32>(AX_InitLib());
    if (status > 0) {
        VLN_LOG(VLN_CRIT, "Error : Initialization of AXLib:: AX_InitLib failed with[%d]", status);
        // Removed, so that a later load in this process starts afresh.
        s_initialising = nullptr;
        sem_post(semaphore);
        closeAndUnlink(semaphore);
        throw std::exception();
    }
    VLN_LOG(VLN_DBG, "Signalling Completed Semaphore.. Running AX_InitLib");
    sem_post(semaphore);
    VLN_LOG(VLN_DBG, "Signaled Completed Semaphore.. Running AX_InitLib");
}

} // namespace

VLN_MethodWrapper::VLN_MethodWrapper() {
    VLN_LOG(VLN_DBG, "VLN_MethodWrapper::Constructor");
    VLN_LOG(VLN_DBG, "Setting Up for FIFO.. ");
    const Semaphore_Name name = initialisingName();
    sem_t* semaphore = openSemaphore(name);
    // Without a semaphore the library is left as it is, and nobody is told: the calls will fail.
    if (semaphore) {
        const int value = valueOf(semaphore);
        waitFor(semaphore);
        if (value == INITIALISER) {
            initialiseLibrary(semaphore);
        } else {
            VLN_LOG(VLN_DBG, "Waiting on Completed Semaphore.. To issue AX Calls..%s.. sem = %p",
                    name.text, static_cast<void*>(semaphore));
            waitFor(semaphore);
            VLN_LOG(VLN_DBG, "Recieved signal on Completed Semaphore.. To issue AX Calls");
        }
    }
    VLN_LOG(VLN_DBG, "AX Library initialized");
}

void VLN_MethodWrapper::removeSemaphores() noexcept {
    if (s_initialising)
        unlinkNames();
}

VLN_MethodWrapper::~VLN_MethodWrapper() {
    // Taken out, so that a second wrapper of the process leaves a closed semaphore alone.
    if (sem_t* semaphore = s_initialising.exchange(nullptr)) {
        sem_post(semaphore);
        VLN_LOG(VLN_DBG, "Value of Sem in destructor=%d", valueOf(semaphore));
        closeAndUnlink(semaphore);
    }
    VLN_LOG(VLN_DBG, "AX Library uninitialzed");
}

} // namespace cimple
