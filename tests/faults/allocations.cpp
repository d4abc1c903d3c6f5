#include "tests/faults/allocations.hpp"

#include <cstdlib>
#include <new>

namespace talutil::testing {

namespace {

constinit bool is_armed = false;
constinit std::size_t left = 0;
constinit bool has_failed = false;

}  // namespace

FailingAllocation::FailingAllocation(std::size_t number) noexcept {
  left = number;
  has_failed = false;
  is_armed = true;
}

FailingAllocation::~FailingAllocation() { is_armed = false; }

bool FailingAllocation::is_reached() noexcept { return has_failed; }

static void* allocate(std::size_t size) {
  if (is_armed && left-- == 0) {
    is_armed = false;
    has_failed = true;
    throw std::bad_alloc();
  }
  void* const memory = std::malloc(size);
  if (memory == nullptr) throw std::bad_alloc();
  return memory;
}

}  // namespace talutil::testing

void* operator new(std::size_t size) { return talutil::testing::allocate(size); }
void operator delete(void* memory) noexcept { std::free(memory); }
void operator delete(void* memory, std::size_t /*size*/) noexcept { std::free(memory); }
