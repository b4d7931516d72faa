// What the starving module exports beside the factories: it is the product with every allocation of
// its own code counted, and one of them refused, and with its threads refused at will.
#ifndef TESTS_HOSTILE_STARVING_H
#define TESTS_HOSTILE_STARVING_H

#define STARVING_HOOK extern "C" __attribute__((visibility("default")))

// The allocation with that number from now on, counted from 1 over all threads, finds no memory; 0
// for none. Answers how many there were since the last call.
STARVING_HOOK unsigned long starve(unsigned long number);

// From now on no thread can be started, or each can again.
STARVING_HOOK void refuse_threads(bool refused);

#endif // TESTS_HOSTILE_STARVING_H
