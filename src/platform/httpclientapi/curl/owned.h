// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <memory>
#include <type_traits>

// An object of a C library, and the function that releases it.
template <typename Object, auto release>
using Owned = std::unique_ptr<Object, std::integral_constant<decltype(release), release>>;
