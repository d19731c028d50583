#include "tests/support/MemoryMeter.h"

#include <malloc.h>

#include <atomic>
#include <cstdlib>
#include <new>

namespace {

std::atomic<std::size_t> bytesHeld{0};
std::atomic<std::size_t> bytesAtPeak{0};

void* allocate(std::size_t size) {
  void* const memory = std::malloc(size == 0 ? 1 : size);
  if (memory == nullptr) throw std::bad_alloc();
  const std::size_t added = ::malloc_usable_size(memory);
  const std::size_t held = bytesHeld.fetch_add(added) + added;
  std::size_t peak = bytesAtPeak.load();
  while (held > peak && !bytesAtPeak.compare_exchange_weak(peak, held)) {
  }
  return memory;
}

void release(void* memory) {
  if (memory == nullptr) return;
  bytesHeld.fetch_sub(::malloc_usable_size(memory));
  std::free(memory);
}

}  // namespace

// The array and the non-throwing forms end in these.
void* operator new(std::size_t size) { return allocate(size); }
void operator delete(void* memory) noexcept { release(memory); }
void operator delete(void* memory, std::size_t) noexcept { release(memory); }

namespace vantrell {

MemoryMeter::MemoryMeter() : _before(bytesHeld.load()) { bytesAtPeak.store(_before); }

std::size_t MemoryMeter::peakBytes() const { return bytesAtPeak.load() - _before; }

}  // namespace vantrell
