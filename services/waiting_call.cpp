#include "services/waiting_call.h"

#include "cimple/thread.h"
#include "foundation/log.h"

namespace cimple {

namespace {

// A leaf: nothing else is locked under it.
constinit Process_Wide<Mutex> calls_mutex;
constinit Process_Wide<Cond> call_ended;
constinit Waiting_Call* calls = nullptr;

} // namespace

Waiting_Call::Waiting_Call(const Meta_Class& owner) : m_owner(owner) {
    const Auto_Mutex lock(*calls_mutex);
    m_next = calls;
    calls = this;
}

Waiting_Call::~Waiting_Call() {
    const Auto_Mutex lock(*calls_mutex);
    Waiting_Call** place = &calls;
    while (*place != this)
        place = &(*place)->m_next;
    *place = m_next;
    call_ended->broadcast();
}

void Waiting_Call::end_all(const Meta_Class& owner) {
    {
        const Auto_Mutex lock(*calls_mutex);
        for (Waiting_Call* each = calls; each; each = each->m_next)
            if (&each->m_owner == &owner)
                raise_flag(each->m_stop);
    }
    Time::wake();
    VLN_LOG(VLN_DBG, "%s_Provider::unload(): ending the calls that wait", owner.name);
    const Auto_Mutex lock(*calls_mutex);
    const auto any_left = [&owner] {
        const Waiting_Call* each = calls;
        while (each && !(each->m_stop && &each->m_owner == &owner))
            each = each->m_next;
        return each != nullptr;
    };
    while (any_left())
        call_ended->wait(*calls_mutex);
}

} // namespace cimple
