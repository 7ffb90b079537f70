// SPDX-License-Identifier: Apache-2.0
// Hands libFuzzer's inputs to the target that the environment names.
#include "session.h"

#include <cstddef>
#include <cstdint>

namespace {

fuzz::Target theTarget = nullptr;

} // namespace

extern "C" int LLVMFuzzerInitialize(int *argc, char ***argv)
{
    theTarget = fuzz::openSession(*argc, *argv);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    fuzz::run(theTarget, QByteArray(reinterpret_cast<const char *>(data), static_cast<int>(size)));
    return 0;
}
