// SPDX-License-Identifier: Apache-2.0
#include "backupconfig.h"

#include "logtext.h"
#include "regularfile.h"
#include "wellknownpaths.h"

#include <QFile>
#include <QSettings>

#include <QDebug>

namespace regularfile = vesk::base::regularfile;

namespace {

constexpr int kOctal = 8;
constexpr int kHexadecimal = 16;
constexpr int kUnitMask = 0xffff; // of UTF-16: what the settings class keeps of an escaped number
constexpr int kDelete = 0x7f;

// -1 for what is no digit.
int digitOf(char character, int base)
{
    bool isDigit = false;
    const int digit = QByteArray(1, character).toInt(&isDigit, base);
    return isDigit ? digit : -1;
}

// What the escape whose first character is at `at` stands for, or 0 where it is no number; `at` moves behind
// it.
int readEscape(const QByteArray &ini, int &at)
{
    const bool isOctal = digitOf(ini.at(at), kOctal) >= 0;
    const int base = isOctal ? kOctal : kHexadecimal;
    if (!isOctal && ini.at(at++) != 'x')
        return 0;
    int unit = 0;
    for (int digit = 0; at < ini.size() && (digit = digitOf(ini.at(at), base)) >= 0; ++at)
        unit = (unit * base + digit) & kUnitMask;
    return unit;
}

// The visible ASCII characters that the settings class would see, but for quotes. Some of the others it
// drops, too, when it puts a value together, so none of them may part a word here.
QByteArray visibleCharacters(const QByteArray &ini)
{
    QByteArray visible;
    for (int at = 0; at < ini.size();) {
        int unit = static_cast<unsigned char>(ini.at(at++));
        if (unit == '\\')
            unit = at < ini.size() ? readEscape(ini, at) : 0;
        if (unit > ' ' && unit < kDelete && unit != '"')
            visible += static_cast<char>(unit);
    }
    return visible;
}

// The two types of value that the settings class reads from a stream: a few bytes there may ask for any
// amount of memory, and for objects inside objects without end.
bool holdsStream(const QByteArray &ini)
{
    const QByteArray visible = visibleCharacters(ini);
    return visible.contains("@Variant(") || visible.contains("@DateTime(");
}

bool isFit(const QString &path)
{
    // The settings class would wait at a pipe and read whatever a device gives.
    QFile file(path);
    if (!regularfile::openToRead(file, QIODevice::ReadOnly))
        return false;
    if (!holdsStream(regularfile::readAll(file)))
        return true;
    qWarning().noquote() << vesk::base::logText(path) << "is not read: it holds a serialized object";
    return false;
}

} // namespace

namespace backupconfig {

QStringList controlCenterList()
{
    const QString path = QString::fromUtf8(vesk::kBackupConfigPath);
    if (!isFit(path))
        return {};
    QSettings backup(path, QSettings::IniFormat);
    backup.beginGroup(QStringLiteral("config"));
    return backup.value(QStringLiteral("ControlCenterList")).toStringList();
}

} // namespace backupconfig
