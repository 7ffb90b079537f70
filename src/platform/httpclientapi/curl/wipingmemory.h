// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <cstddef>

// As free() and realloc(), but what is given back is overwritten first: libcurl's buffers have held requests.
void wipingFree(void *memory);
void *wipingRealloc(void *memory, size_t size);
