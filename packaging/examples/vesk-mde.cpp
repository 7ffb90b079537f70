// SPDX-License-Identifier: Apache-2.0
#include <libveskmde.h>

#include <QCoreApplication>

// Empty: the policy's schema is installed and has taken the value.
int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    Libveskmde policy;
    return policy.SetLauncherDisplayable(true).isEmpty() ? 0 : 1;
}
