// Flags that threads read outside the lock they are written under.
//
// They are plain bytes and meant to be: the locks around most accesses order them, and where there
// is none a late reading does no harm, since it shows old stores that are still whole. Each such
// flag has a name as a type, by which tests/tsan.supp knows it; reading and writing are functions
// of their own for the thread sanitizer, so that nothing else hides behind a suppressed name.
#ifndef VLN_AGENT_PLAIN_FLAG_H
#define VLN_AGENT_PLAIN_FLAG_H

#if defined(__SANITIZE_THREAD__)
#define VLN_FLAG_ACCESS __attribute__((noinline))
#else
#define VLN_FLAG_ACCESS
#endif

namespace cimple {

template <class Name>
class Plain_Flag {
public:
    constexpr Plain_Flag(bool value) noexcept : _value(value) {}
    Plain_Flag(const Plain_Flag&) = delete;
    Plain_Flag& operator=(const Plain_Flag&) = delete;

    VLN_FLAG_ACCESS operator bool() const noexcept { return _value; }
    VLN_FLAG_ACCESS void operator=(bool value) noexcept { _value = value; }

private:
    bool _value;
};

#undef VLN_FLAG_ACCESS

namespace flag {

struct m_bAdapterRefreshRequested;
struct m_bSANRefreshRequested;
struct m_bSANMapsAsked;
struct m_bLibraryLoaded;
struct m_bIsAdapterMapsReady;
struct m_bIsSANMapsReady;

} // namespace flag

} // namespace cimple

#endif // VLN_AGENT_PLAIN_FLAG_H
