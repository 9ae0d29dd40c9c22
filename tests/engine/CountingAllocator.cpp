#include "tests/engine/CountingAllocator.h"

#include <cstdlib>
#include <new>

namespace {

// A constant until main: allocations begin before.
constinit std::size_t allocations = 0;

void* Counted(std::size_t size) noexcept {
  ++allocations;
  return std::malloc(size == 0 ? 1 : size);
}

void* Counted(std::size_t size, std::align_val_t alignment) noexcept {
  ++allocations;
  const auto step = static_cast<std::size_t>(alignment);
  return std::aligned_alloc(step, (size + step) / step * step);
}

void* OrThrow(void* memory) {
  if (memory == nullptr) throw std::bad_alloc();
  return memory;
}

}  // namespace

std::size_t Allocations() { return allocations; }

// Each form stands here, since a sanitizer's runtime has all of them, too.
void* operator new(std::size_t size) { return OrThrow(Counted(size)); }
void* operator new[](std::size_t size) { return OrThrow(Counted(size)); }
void* operator new(std::size_t size, const std::nothrow_t&) noexcept { return Counted(size); }
void* operator new[](std::size_t size, const std::nothrow_t&) noexcept { return Counted(size); }
void* operator new(std::size_t size, std::align_val_t alignment) {
  return OrThrow(Counted(size, alignment));
}
void* operator new[](std::size_t size, std::align_val_t alignment) {
  return OrThrow(Counted(size, alignment));
}
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete[](void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t) noexcept { std::free(memory); }
void operator delete(void* memory, const std::nothrow_t&) noexcept { std::free(memory); }
void operator delete[](void* memory, const std::nothrow_t&) noexcept { std::free(memory); }
void operator delete(void* memory, std::align_val_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::align_val_t) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t, std::align_val_t) noexcept { std::free(memory); }
void operator delete[](void* memory, std::size_t, std::align_val_t) noexcept {
  std::free(memory);
}
