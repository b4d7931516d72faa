// Calls that wait for minutes, for a test to end or a server to answer, and how an unload of their
// class cuts them short.
#ifndef VLN_SERVICES_WAITING_CALL_H
#define VLN_SERVICES_WAITING_CALL_H

#include "cimple/meta.h"

namespace cimple {

// Stands for such a call from its very beginning, before it has any lock, to its end.
class Waiting_Call {
public:
    explicit Waiting_Call(const Meta_Class& owner);
    ~Waiting_Call();
    Waiting_Call(const Waiting_Call&) = delete;
    Waiting_Call& operator=(const Waiting_Call&) = delete;

    // Goes up once an unload wants the call over, and ends a Time::sleep that looks at it.
    const bool& stop() const { return m_stop; }

    // Wants the calls of a class over that are under way, and waits until they are, so that they
    // have the agent to their end even where they have none of its locks. Those that begin later
    // are left alone. No lock is held.
    static void end_all(const Meta_Class& owner);

private:
    const Meta_Class& m_owner;
    bool m_stop = false;
    Waiting_Call* m_next;
};

} // namespace cimple

#endif // VLN_SERVICES_WAITING_CALL_H
