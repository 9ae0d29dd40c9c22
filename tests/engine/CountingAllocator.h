// An allocator that counts: the operators new and delete of the program that is linked with
// CountingAllocator.cpp.
#ifndef VORKEL_TESTS_ENGINE_COUNTINGALLOCATOR_H_
#define VORKEL_TESTS_ENGINE_COUNTINGALLOCATOR_H_

#include <cstddef>

// How many times the program has asked for memory, by whichever form of new.
std::size_t Allocations();

#endif  // VORKEL_TESTS_ENGINE_COUNTINGALLOCATOR_H_
