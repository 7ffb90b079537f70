// SPDX-License-Identifier: Apache-2.0
#include "session.h"

#include "logcapture.h"
#include "scriptedtransport.h"

#include <QApplication>

#include <cstdio>
#include <cstdlib>

namespace fuzz {

namespace {

// Set by those who start targets through vesk-isolate; without it a target would write to the machine's
// files.
constexpr char kIsolatedVariable[] = "VESK_FUZZ_ISOLATED";
constexpr char kTargetVariable[] = "VESK_FUZZ_TARGET";

[[noreturn]] void refuse(const char *reason)
{
    std::fprintf(stderr, "%s\n", reason);
    std::exit(2);
}

} // namespace

Target openSession(int &argc, char **argv)
{
    if (qEnvironmentVariableIsEmpty(kIsolatedVariable))
        refuse("fuzz targets write to /etc/vesk and /tmp: start them with fuzz/run");
    const Target target = targetNamed(qgetenv(kTargetVariable));
    if (target == nullptr)
        refuse("VESK_FUZZ_TARGET names no target");
    qputenv("QT_QPA_PLATFORM", "offscreen");
    qputenv("DBUS_SESSION_BUS_ADDRESS", "unix:path=/nonexistent");
    qputenv("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/nonexistent");
    qunsetenv("TMPDIR"); // staged files belong below /tmp
    // For as long as the process: windows that targets keep outlive every local object.
    static const auto *application = new QApplication(argc, argv);
    Q_UNUSED(application)
    return target;
}

void run(Target target, const QByteArray &input)
{
    const LogCapture log; // the code under test writes none: that would slow it down
    scriptedtransport::script({});
    target(input);
}

} // namespace fuzz
