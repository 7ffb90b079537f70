// SPDX-License-Identifier: Apache-2.0
// Hands libFuzzer's inputs to the target that the environment names.
#include "session.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <ctime>

namespace {

fuzz::Target theTarget = nullptr;

// For fuzz/run, which cannot see it from outside of the view.
void tellProcessorTime()
{
    std::fprintf(stderr, "PROCESSOR TIME %.1f\n", static_cast<double>(std::clock()) / CLOCKS_PER_SEC);
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int *argc, char ***argv)
{
    theTarget = fuzz::openSession(*argc, *argv);
    std::atexit(tellProcessorTime);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size)
{
    fuzz::run(theTarget, QByteArray(reinterpret_cast<const char *>(data), static_cast<int>(size)));
    return 0;
}
