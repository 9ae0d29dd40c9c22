#include "tests/support/RefusingAllocator.h"

#include <cstdlib>
#include <new>

namespace {

constexpr std::size_t kNoSize = 0;
constexpr int kNever = -1;

// Constants until a test sets them: allocations begin before main.
constinit std::size_t refusedSize = kNoSize;
constinit int allocationsUntilRefusal = kNever;
constinit bool refusesAllBehind = false;
constinit int refusals = 0;
constinit std::size_t countedSize = kNoSize;
constinit int frees = 0;

void* Allocate(std::size_t size) noexcept {
  if (allocationsUntilRefusal == 0) {
    if (!refusesAllBehind) allocationsUntilRefusal = kNever;
    ++refusals;
    return nullptr;
  }
  if (allocationsUntilRefusal != kNever) --allocationsUntilRefusal;
  return std::malloc(size == 0 ? 1 : size);
}

}  // namespace

RefuseSize::RefuseSize(std::size_t size) {
  refusedSize = size;
  refusals = 0;
}

RefuseSize::~RefuseSize() { refusedSize = kNoSize; }

RefuseAfter::RefuseAfter(int allocations) {
  allocationsUntilRefusal = allocations;
  refusals = 0;
}

RefuseAfter::~RefuseAfter() { allocationsUntilRefusal = kNever; }

RefuseFrom::RefuseFrom(int allocations) {
  allocationsUntilRefusal = allocations;
  refusesAllBehind = true;
  refusals = 0;
}

RefuseFrom::~RefuseFrom() {
  allocationsUntilRefusal = kNever;
  refusesAllBehind = false;
}

int Refusals() { return refusals; }

CountFrees::CountFrees(std::size_t size) {
  countedSize = size;
  frees = 0;
}

CountFrees::~CountFrees() { countedSize = kNoSize; }

int CountFrees::Count() const { return frees; }

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
  if (refusedSize != kNoSize && size == refusedSize) {
    ++refusals;
    return nullptr;
  }
  return Allocate(size);
}

void* operator new(std::size_t size) {
  void* const memory = Allocate(size);
  if (memory == nullptr) throw std::bad_alloc();
  return memory;
}

void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t size) noexcept {
  if (countedSize != kNoSize && size == countedSize) ++frees;
  std::free(memory);
}
void operator delete(void* memory, const std::nothrow_t&) noexcept { std::free(memory); }
