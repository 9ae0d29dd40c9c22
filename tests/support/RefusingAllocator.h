// An allocator that can be told to refuse memory and to count what is freed: the operators new and
// delete of the program that is linked with RefusingAllocator.cpp.
#ifndef VORKEL_TESTS_SUPPORT_REFUSINGALLOCATOR_H_
#define VORKEL_TESTS_SUPPORT_REFUSINGALLOCATOR_H_

#include <cstddef>

// While it lives, the allocation that reports failure by null refuses objects of `size` bytes.
class RefuseSize {
 public:
  explicit RefuseSize(std::size_t size);
  ~RefuseSize();
  RefuseSize(const RefuseSize&) = delete;
  RefuseSize& operator=(const RefuseSize&) = delete;
};

// While it lives, the allocation that comes after so many others is refused, whichever way it
// reports that. Only one is.
class RefuseAfter {
 public:
  explicit RefuseAfter(int allocations);
  ~RefuseAfter();
  RefuseAfter(const RefuseAfter&) = delete;
  RefuseAfter& operator=(const RefuseAfter&) = delete;
};

// The same for all allocations from that one on.
class RefuseFrom {
 public:
  explicit RefuseFrom(int allocations);
  ~RefuseFrom();
  RefuseFrom(const RefuseFrom&) = delete;
  RefuseFrom& operator=(const RefuseFrom&) = delete;
};

// How many allocations were refused since the last of these objects was made.
int Refusals();

// While it lives, counts the objects of `size` bytes that are deleted. One at a time.
class CountFrees {
 public:
  explicit CountFrees(std::size_t size);
  ~CountFrees();
  CountFrees(const CountFrees&) = delete;
  CountFrees& operator=(const CountFrees&) = delete;

  int Count() const;
};

#endif  // VORKEL_TESTS_SUPPORT_REFUSINGALLOCATOR_H_
