// SPDX-License-Identifier: Apache-2.0
#include "libveskmde.h"

#include <QCoreApplication>
#include <QTextStream>
#include <QVariant>

// Calls each setter once and prints its name and result, one line for each. The first argument is the number
// that stands for on or off, the others are the pages of the control centre.
int main(int argc, char **argv)
{
    const QCoreApplication application(argc, argv);
    QStringList arguments = QCoreApplication::arguments().mid(1);
    const int number = arguments.takeFirst().toInt();
    const bool on = number == 1;

    QTextStream out(stdout);
    out.setCodec("UTF-8");
    const auto print = [&out](const char *setter, const QVariant &result) {
        out << setter << '\t' << result.toString() << '\n';
    };

    Libveskmde policy;
    print("SetControlConfig", policy.SetControlConfig(arguments, {QString()}));
    print("SetHotspotEnable", policy.SetHotspotEnable(number));
    print("SetShortcutKeyEnable", policy.SetShortcutKeyEnable(on));
    print("SetLauncherDisplayable", policy.SetLauncherDisplayable(on));
    print("SetTaskbarRightclickMenuEnable", policy.SetTaskbarRightclickMenuEnable(on));
    print("SetResidentTaskbarAppDisplayable", policy.SetResidentTaskbarAppDisplayable(on));
    print("SetRecycleBinDisplayable", policy.SetRecycleBinDisplayable(on));
    print("SetWebTrayIconClickable", policy.SetWebTrayIconClickable(on));
    print("SetUsbTrayIconClickable", policy.SetUsbTrayIconClickable(on));
    return 0;
}
