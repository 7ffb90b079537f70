// SPDX-License-Identifier: Apache-2.0
#pragma once

// The D-Bus library does all its work in a thread of its own, which it starts with the first connection;
// where that fails, it waits for the thread for ever, also when the accessibility interface is the first to
// ask, which is before there is a window. So main() has it started while it can still be told.
//
// Starts that thread, without a connection. False when it cannot be started: no bus may be used then. To be
// called while this process has no other thread.
bool startBusThread();
