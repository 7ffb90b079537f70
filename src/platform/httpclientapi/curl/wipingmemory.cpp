// SPDX-License-Identifier: Apache-2.0
#include "wipingmemory.h"

#include <cstdlib>
#include <cstring>

#include <malloc.h>

void wipingFree(void *memory)
{
    if (memory != nullptr)
        ::explicit_bzero(memory, ::malloc_usable_size(memory));
    std::free(memory);
}

// Never in place: the library's own may move what it holds and leave the old bytes behind.
void *wipingRealloc(void *memory, size_t size)
{
    void *made = std::malloc(size);
    if (memory == nullptr || made == nullptr)
        return made;
    const size_t before = ::malloc_usable_size(memory);
    std::memcpy(made, memory, before < size ? before : size);
    wipingFree(memory);
    return made;
}
