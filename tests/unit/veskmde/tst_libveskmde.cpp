// SPDX-License-Identifier: Apache-2.0
#include "isolatedfiles.h"

#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtTest>

namespace {

const QStringList kSetters = QStringLiteral("SetControlConfig SetHotspotEnable SetShortcutKeyEnable "
                                            "SetLauncherDisplayable SetTaskbarRightclickMenuEnable "
                                            "SetResidentTaskbarAppDisplayable SetRecycleBinDisplayable "
                                            "SetWebTrayIconClickable SetUsbTrayIconClickable")
                                 .split(QLatin1Char(' '));

const QByteArray kSchema = isolatedfiles::read(QStringLiteral(POLICY_SCHEMA));

QByteArray locksOnAllKeys()
{
    QByteArray locks;
    static const QRegularExpression key(QStringLiteral("<key name=\"([a-z-]+)\""));
    for (auto found = key.globalMatch(QString::fromUtf8(kSchema)); found.hasNext();)
        locks += "/com/morvek/vesk/mde-policy/" + found.next().captured(1).toUtf8() + '\n';
    return locks;
}

// What one call of all setters left: those that failed, each with its result, the text that it returned or
// "false", and what was logged of them.
struct Outcome
{
    QStringList failed;
    QStringList results;
    QStringList warnings;
};

// Schema and settings for one process, away from those of the machine, and no bus.
class Surroundings
{
public:
    Surroundings()
    {
        set("GSETTINGS_BACKEND", QStringLiteral("keyfile"));
        set("GSETTINGS_SCHEMA_DIR", path("schemas"));
        set("XDG_DATA_DIRS", path("no-data"));
        set("XDG_DATA_HOME", path("no-data"));
        set("XDG_CONFIG_HOME", path("config"));
        set("XDG_RUNTIME_DIR", path("runtime"));
        set("DBUS_SESSION_BUS_ADDRESS", QStringLiteral("unix:path=/nonexistent/bus"));
    }

    void set(const char *name, const QString &value) { m_environment.insert(QLatin1String(name), value); }
    QByteArray keptSettings() const { return isolatedfiles::read(path("config/glib-2.0/settings/keyfile")); }

    bool installSchema(const QByteArray &text) const
    {
        return isolatedfiles::write(path("schemas/policy.gschema.xml"), text) &&
               QProcess::execute(QStringLiteral(GLIB_COMPILE_SCHEMAS), {path("schemas")}) == 0;
    }

    // The desktop's usual settings service, with an administrator's locks; an empty text locks nothing.
    bool useDconf(const QByteArray &locks)
    {
        set("GSETTINGS_BACKEND", QStringLiteral("dconf"));
        set("DCONF_PROFILE", path("profile"));
        return isolatedfiles::write(path("profile"),
                                    "user-db:user\nfile-db:" + QFile::encodeName(path("administrator"))) &&
               isolatedfiles::write(path("policy.d/locks/policy"), locks) &&
               QProcess::execute(QStringLiteral(DCONF),
                                 {QStringLiteral("compile"), path("administrator"), path("policy.d")}) == 0;
    }

    Outcome callSetters(const QStringList &arguments) const
    {
        QProcess caller;
        caller.setProcessEnvironment(m_environment);
        caller.start(QStringLiteral(POLICY_CALLER), arguments);
        if (!caller.waitForFinished() || caller.exitStatus() != QProcess::NormalExit ||
            caller.exitCode() != 0)
            return {{QStringLiteral("the process did not end by itself")}, {}, {}};
        Outcome outcome;
        const QStringList lines = QString::fromUtf8(caller.readAllStandardOutput()).split(QLatin1Char('\n'));
        for (const QString &line : lines) {
            const QString result = line.section(QLatin1Char('\t'), 1);
            if (result.isEmpty() || result == QStringLiteral("true"))
                continue;
            outcome.failed << line.section(QLatin1Char('\t'), 0, 0);
            outcome.results << result;
        }
        outcome.warnings = QString::fromUtf8(caller.readAllStandardError())
                               .split(QLatin1Char('\n'))
                               .filter(QStringLiteral(" failed: "));
        return outcome;
    }

private:
    QString path(const char *name) const { return m_directory.filePath(QLatin1String(name)); }

    QTemporaryDir m_directory;
    QProcessEnvironment m_environment = QProcessEnvironment::systemEnvironment();
};

using Arrange = bool (*)(Surroundings &);

bool installChangedSchema(const Surroundings &surroundings, const char *before, const char *after)
{
    return kSchema.contains(before) && surroundings.installSchema(QByteArray(kSchema).replace(before, after));
}

} // namespace
Q_DECLARE_METATYPE(Arrange)

// The setters against GSettings in each state in which a terminal may have it. Every case runs in a process
// of its own, which has to end by itself.
class TestLibveskmde : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void keepsPolicy_data();
    void keepsPolicy();
    void tellsWhatFailed_data();
    void tellsWhatFailed();
};

void TestLibveskmde::keepsPolicy_data()
{
    QTest::addColumn<QString>("arguments");
    QTest::addColumn<QByteArray>("shown");
    QTest::addColumn<QByteArray>("onOff");
    QTest::newRow("restricted") << QStringLiteral("0|it's, \"so\"|网络|")
                                << QByteArray("[\"it's, \\\"so\\\"\", '网络', '']") << QByteArray("false");
    QTest::newRow("lifted") << QStringLiteral("1") << QByteArray("[]") << QByteArray("true");
}

void TestLibveskmde::keepsPolicy()
{
    QFETCH(QString, arguments);
    QFETCH(QByteArray, shown);
    QFETCH(QByteArray, onOff);
    Surroundings surroundings;
    QVERIFY(surroundings.installSchema(kSchema));
    const Outcome outcome = surroundings.callSetters(arguments.split(QLatin1Char('|')));
    QCOMPARE(outcome.failed, QStringList());
    QCOMPARE(outcome.warnings, QStringList());

    // In the order of the calls.
    QList<QByteArray> expected{"[com/morvek/vesk/mde-policy]", "control-center-shown=" + shown,
                               "control-center-hidden=['']"};
    for (const char *key :
         {"hotspot-enabled", "shortcut-keys-enabled", "launcher-displayed", "taskbar-menu-enabled",
          "resident-taskbar-apps-displayed", "recycle-bin-displayed", "network-tray-icon-clickable",
          "usb-tray-icon-clickable"})
        expected << key + ('=' + onOff);
    QCOMPARE(surroundings.keptSettings().trimmed().split('\n'), expected);
}

void TestLibveskmde::tellsWhatFailed_data()
{
    QTest::addColumn<Arrange>("arrange");
    QTest::addColumn<QStringList>("failed");
    QTest::addColumn<QString>("reason");

    const QStringList launcher{QStringLiteral("SetLauncherDisplayable")};
    QTest::newRow("neither on nor off")
        << Arrange([](Surroundings &it) { return it.installSchema(kSchema); })
        << QStringList{QStringLiteral("SetHotspotEnable")} << QStringLiteral("2 is neither 0 nor 1");
    QTest::newRow("schema missing") << Arrange([](Surroundings &) { return true; }) << kSetters
                                    << QStringLiteral("not installed");
    QTest::newRow("no key of that name") << Arrange([](Surroundings &it) {
        return installChangedSchema(it, "launcher-displayed", "launcher-shown");
    }) << launcher << QStringLiteral("key launcher-displayed of com.morvek.vesk.mde-policy is not in");
    QTest::newRow("key of another type") << Arrange([](Surroundings &it) {
        return installChangedSchema(it, "\"launcher-displayed\" type=\"b\">\n      <default>true",
                                    "\"launcher-displayed\" type=\"i\">\n      <default>1");
    }) << launcher << QStringLiteral("another type");
    QTest::newRow("nothing kept") << Arrange([](Surroundings &it) {
        it.set("GSETTINGS_BACKEND", QStringLiteral("memory"));
        return it.installSchema(kSchema);
    }) << kSetters << QStringLiteral("keeps values");
    QTest::newRow("service not there")
        << Arrange([](Surroundings &it) { return it.installSchema(kSchema) && it.useDconf(QByteArray()); })
        << kSetters << QStringLiteral("was not kept");
    QTest::newRow("all locked") << Arrange([](Surroundings &it) {
        return it.installSchema(kSchema) && it.useDconf(locksOnAllKeys());
    }) << kSetters << QStringLiteral("is locked");
}

void TestLibveskmde::tellsWhatFailed()
{
    QFETCH(Arrange, arrange);
    QFETCH(QStringList, failed);
    QFETCH(QString, reason);
    Surroundings surroundings;
    QVERIFY(arrange(surroundings));

    const bool isOdd = qstrcmp(QTest::currentDataTag(), "neither on nor off") == 0;
    const Outcome outcome = surroundings.callSetters(
        {isOdd ? QStringLiteral("2") : QStringLiteral("0"), QStringLiteral("display")});
    QCOMPARE(outcome.failed, failed);
    QCOMPARE(outcome.warnings.size(), failed.size());
    for (int i = 0; i < failed.size(); ++i) {
        const QString warning = outcome.warnings.at(i);
        const QString result = outcome.results.at(i);
        QVERIFY2(warning.startsWith(failed.at(i)) && warning.contains(reason), qPrintable(warning));
        QVERIFY2(result == QStringLiteral("false") || warning.endsWith(result), qPrintable(result));
    }
}

QTEST_GUILESS_MAIN(TestLibveskmde)
#include "tst_libveskmde.moc"
