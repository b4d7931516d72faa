// What the bench module exports beside the factories.
#ifndef BENCH_BENCH_HOOKS_H
#define BENCH_BENCH_HOOKS_H

#define VLN_BENCH_HOOK extern "C" __attribute__((visibility("default")))

// Fills the store of VLNMPCA_EthernetPort with copies of its first instance, each with a DeviceID
// of its own, up to the count. The first enumeration must be over. Answers the size of the store.
VLN_BENCH_HOOK unsigned vln_bench_fill(unsigned count);

// Does with that store what an enumeration owes to its locks, and no more: a clone of each instance
// into a local map, and one more of each to give away.
VLN_BENCH_HOOK void vln_bench_clones();

#endif // BENCH_BENCH_HOOKS_H
