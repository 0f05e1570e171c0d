#include "decoding/Counting.h"

#include <cstdlib>
#include <new>

namespace {
std::size_t count = 0; // only one thread measures
}

void* operator new(std::size_t size)
{
    ++count;
    if (void* memory = std::malloc(size != 0 ? size : 1))
        return memory;
    throw std::bad_alloc();
}
void operator delete(void* memory) noexcept
{
    std::free(memory);
}
void operator delete(void* memory, std::size_t) noexcept
{
    std::free(memory);
}

std::size_t kestrum::bench::allocations()
{
    return count;
}
