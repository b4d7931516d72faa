// What the bench module exports beside the factories.
#ifndef BENCH_BENCH_HOOKS_H
#define BENCH_BENCH_HOOKS_H

#define VLN_BENCH_HOOK extern "C" __attribute__((visibility("default")))

// Fills the store of VLNMPCA_EthernetPort with copies of its first instance, each with a DeviceID
// of its own, up to the count. The first enumeration must be over. Answers the size of the store.
VLN_BENCH_HOOK unsigned vln_bench_fill(unsigned count);

// Call one function of the management library so many times: through its bound function, and by a
// pointer to it. The difference is what the binding costs.
inline constexpr unsigned VLN_BENCH_CALLS = 100000;
VLN_BENCH_HOOK void vln_bench_bound_calls();
VLN_BENCH_HOOK void vln_bench_direct_calls();

// One full pass over the adapters, from the decision to the end of the thread, without a SAN pass,
// an hour of the virtual clock after the last. False when none was made.
VLN_BENCH_HOOK bool vln_bench_refresh();

// One SAN pass, without a scan of the adapters.
VLN_BENCH_HOOK void vln_bench_san_refresh();

// For one client alone, and counted to the instruction: nobody looks again and again whether it is
// over. What the last call has started has ended when it returns.
VLN_BENCH_HOOK void vln_bench_settle();
// A refresh of all, an hour of the virtual clock after the last; a SAN pass alone. False when none
// was made.
VLN_BENCH_HOOK bool vln_bench_whole_refresh();
VLN_BENCH_HOOK bool vln_bench_san_pass();

// Instances in all stores, or in all but those that a SAN pass fills.
VLN_BENCH_HOOK unsigned vln_bench_instances(bool san);

#endif // BENCH_BENCH_HOOKS_H
