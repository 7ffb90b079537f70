// SPDX-License-Identifier: Apache-2.0
#pragma once

namespace sandbox {

// Leaves this process and its children without a capability, root's too, and without a way to gain one.
bool dropCapabilities();

// Makes the system calls that take paths but that proot does not translate fail with ENOSYS in this process
// and its children, so that libraries fall back to older calls which it does translate. Without this they
// would reach the machine's own files. False when the kernel refuses the filter.
bool withholdUntranslatedCalls();

} // namespace sandbox
