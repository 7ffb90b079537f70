// SPDX-License-Identifier: Apache-2.0
#include "libveskmde.h"

#include <QTextStream>

// Calls each setter once and prints its name and result, one line for each. The first argument is the number
// that stands for on or off, the others are the pages of the control centre.
int main(int argc, char **argv)
{
    QStringList arguments;
    for (int i = 1; i < argc; ++i)
        arguments << QString::fromLocal8Bit(argv[i]);
    const int number = arguments.isEmpty() ? 0 : arguments.takeFirst().toInt();
    const bool on = number == 1;

    QTextStream out(stdout);
    out.setCodec("UTF-8");
    const auto print = [&out](const char *setter, const QString &result) {
        out << setter << '\t' << result << '\n';
    };
    const auto word = [](bool done) {
        return done ? QString() : QStringLiteral("false");
    };

    Libveskmde policy;
    print("SetControlConfig", word(policy.SetControlConfig(arguments, {QString()})));
    print("SetHotspotEnable", word(policy.SetHotspotEnable(number)));
    print("SetShortcutKeyEnable", policy.SetShortcutKeyEnable(on));
    print("SetLauncherDisplayable", policy.SetLauncherDisplayable(on));
    print("SetTaskbarRightclickMenuEnable", policy.SetTaskbarRightclickMenuEnable(on));
    print("SetResidentTaskbarAppDisplayable", policy.SetResidentTaskbarAppDisplayable(on));
    print("SetRecycleBinDisplayable", policy.SetRecycleBinDisplayable(on));
    print("SetWebTrayIconClickable", policy.SetWebTrayIconClickable(on));
    print("SetUsbTrayIconClickable", policy.SetUsbTrayIconClickable(on));
    return 0;
}
