// SPDX-License-Identifier: Apache-2.0
#include <QDir>
#include <QFile>
#include <QMap>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QtTest>

// The setters against GSettings in each state in which a terminal may have it. Every case runs in a process
// of its own, which has to end by itself.
class TestLibveskmde : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void keepsPolicy_data();
    void keepsPolicy();
    void refusesOtherNumbers_data();
    void refusesOtherNumbers();
    void tellsWhatFailed_data();
    void tellsWhatFailed();
};

namespace {

const QStringList kSetters{QStringLiteral("SetControlConfig"),
                           QStringLiteral("SetHotspotEnable"),
                           QStringLiteral("SetShortcutKeyEnable"),
                           QStringLiteral("SetLauncherDisplayable"),
                           QStringLiteral("SetTaskbarRightclickMenuEnable"),
                           QStringLiteral("SetResidentTaskbarAppDisplayable"),
                           QStringLiteral("SetRecycleBinDisplayable"),
                           QStringLiteral("SetWebTrayIconClickable"),
                           QStringLiteral("SetUsbTrayIconClickable")};

bool writeFile(const QString &path, const QByteArray &content)
{
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(content) == content.size();
}

QByteArray readFile(const QString &path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

QByteArray schemaText()
{
    return readFile(QStringLiteral(POLICY_SCHEMA));
}

QByteArray locksOnAllKeys()
{
    QByteArray locks;
    static const QRegularExpression key(QStringLiteral("<key name=\"([a-z-]+)\""));
    for (auto found = key.globalMatch(QString::fromUtf8(schemaText())); found.hasNext();)
        locks += "/com/morvek/vesk/mde-policy/" + found.next().captured(1).toUtf8() + '\n';
    return locks;
}

// What one call of all setters left: results by setter, warnings, exit code.
struct Outcome
{
    QMap<QString, QString> results;
    QStringList warnings;
    int exitCode = -1;

    QStringList failedSetters() const
    {
        QStringList failed;
        for (const QString &setter : kSetters) {
            if (!results.value(setter, QStringLiteral("not called")).isEmpty())
                failed << setter;
        }
        return failed;
    }
};

// Surroundings of their own for one process: schema, settings, no bus.
class Surroundings
{
public:
    Surroundings()
    {
        m_environment.insert(QStringLiteral("GSETTINGS_BACKEND"), QStringLiteral("keyfile"));
        m_environment.insert(QStringLiteral("GSETTINGS_SCHEMA_DIR"), path("schemas"));
        m_environment.insert(QStringLiteral("XDG_DATA_DIRS"), path("no-data"));
        m_environment.insert(QStringLiteral("XDG_DATA_HOME"), path("no-data"));
        m_environment.insert(QStringLiteral("XDG_CONFIG_HOME"), path("config"));
        m_environment.insert(QStringLiteral("XDG_RUNTIME_DIR"), path("runtime"));
        m_environment.insert(QStringLiteral("DBUS_SESSION_BUS_ADDRESS"),
                             QStringLiteral("unix:path=/nonexistent/bus"));
    }

    QString path(const char *name) const { return m_folder.filePath(QLatin1String(name)); }
    void set(const char *name, const QString &value) { m_environment.insert(QLatin1String(name), value); }
    QByteArray keptSettings() const { return readFile(path("config/glib-2.0/settings/keyfile")); }

    bool installSchema(const QByteArray &text) const
    {
        return writeFile(path("schemas/policy.gschema.xml"), text) &&
               QProcess::execute(QStringLiteral(GLIB_COMPILE_SCHEMAS), {path("schemas")}) == 0;
    }

    // The desktop's usual settings service, with an administrator's locks; an empty text locks nothing.
    bool useDconf(const QByteArray &locks)
    {
        set("GSETTINGS_BACKEND", QStringLiteral("dconf"));
        set("DCONF_PROFILE", path("profile"));
        return writeFile(path("profile"),
                         "user-db:user\nfile-db:" + QFile::encodeName(path("administrator")) + '\n') &&
               writeFile(path("policy.d/empty"), "") && writeFile(path("policy.d/locks/policy"), locks) &&
               QProcess::execute(QStringLiteral(DCONF),
                                 {QStringLiteral("compile"), path("administrator"), path("policy.d")}) == 0;
    }

    Outcome callSetters(const QStringList &arguments) const
    {
        QProcess caller;
        caller.setProcessEnvironment(m_environment);
        caller.start(QStringLiteral(POLICY_CALLER), arguments);
        Outcome outcome;
        if (!caller.waitForFinished() || caller.exitStatus() != QProcess::NormalExit)
            return outcome;
        outcome.exitCode = caller.exitCode();
        for (const QString &line : QString::fromUtf8(caller.readAllStandardOutput()).split(QLatin1Char('\n')))
            outcome.results.insert(line.section(QLatin1Char('\t'), 0, 0), line.section(QLatin1Char('\t'), 1));
        outcome.warnings = QString::fromUtf8(caller.readAllStandardError())
                               .split(QLatin1Char('\n'))
                               .filter(QStringLiteral(" failed: "));
        return outcome;
    }

private:
    QTemporaryDir m_folder;
    QProcessEnvironment m_environment = QProcessEnvironment::systemEnvironment();
};

} // namespace

void TestLibveskmde::keepsPolicy_data()
{
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<QByteArray>("shown");
    QTest::addColumn<QByteArray>("onOff");

    QTest::newRow("restricted") << QStringList{QStringLiteral("0"), QStringLiteral("display"),
                                               QStringLiteral("网络")}
                                << QByteArray("['display', '网络']") << QByteArray("false");
    QTest::newRow("lifted") << QStringList{QStringLiteral("1")} << QByteArray("[]") << QByteArray("true");
    QTest::newRow("odd texts") << QStringList{QStringLiteral("1"), QStringLiteral("it's, \"so\""), QString()}
                               << QByteArray("[\"it's, \\\"so\\\"\", '']") << QByteArray("true");
}

void TestLibveskmde::keepsPolicy()
{
    QFETCH(QStringList, arguments);
    QFETCH(QByteArray, shown);
    QFETCH(QByteArray, onOff);
    Surroundings surroundings;
    QVERIFY(surroundings.installSchema(schemaText()));

    const Outcome outcome = surroundings.callSetters(arguments);
    QCOMPARE(outcome.exitCode, 0);
    QCOMPARE(outcome.failedSetters(), QStringList());
    QCOMPARE(outcome.warnings, QStringList());

    const QList<QByteArray> lines = surroundings.keptSettings().trimmed().split('\n');
    const QList<QByteArray> expected{
        "[com/morvek/vesk/mde-policy]",    "control-center-shown=" + shown,
        "control-center-hidden=['']",      "hotspot-enabled=" + onOff,
        "shortcut-keys-enabled=" + onOff,  "launcher-displayed=" + onOff,
        "taskbar-menu-enabled=" + onOff,   "resident-taskbar-apps-displayed=" + onOff,
        "recycle-bin-displayed=" + onOff,  "network-tray-icon-clickable=" + onOff,
        "usb-tray-icon-clickable=" + onOff};
    QCOMPARE(lines, expected);
}

void TestLibveskmde::refusesOtherNumbers_data()
{
    QTest::addColumn<QString>("number");
    QTest::newRow("two") << QStringLiteral("2");
    QTest::newRow("negative") << QStringLiteral("-1");
}

void TestLibveskmde::refusesOtherNumbers()
{
    QFETCH(QString, number);
    Surroundings surroundings;
    QVERIFY(surroundings.installSchema(schemaText()));

    const Outcome outcome = surroundings.callSetters({number});
    QCOMPARE(outcome.failedSetters(), QStringList{QStringLiteral("SetHotspotEnable")});
    QCOMPARE(outcome.warnings.size(), 1);
    QVERIFY(!surroundings.keptSettings().contains("hotspot-enabled"));
}

void TestLibveskmde::tellsWhatFailed_data()
{
    QTest::addColumn<QString>("state");
    QTest::addColumn<QStringList>("failed");
    QTest::addColumn<QString>("reason");

    const QStringList launcher{QStringLiteral("SetLauncherDisplayable")};
    QTest::newRow("schema missing") << QStringLiteral("no schema") << kSetters
                                    << QStringLiteral("not installed");
    QTest::newRow("no key of that name")
        << QStringLiteral("older schema") << launcher
        << QStringLiteral("launcher-displayed of com.morvek.vesk.mde-policy is not in");
    QTest::newRow("key of another type")
        << QStringLiteral("other type") << launcher << QStringLiteral("another type");
    QTest::newRow("nothing kept") << QStringLiteral("memory") << kSetters << QStringLiteral("keeps values");
    QTest::newRow("no place to write to")
        << QStringLiteral("no place") << kSetters << QStringLiteral("place cannot be written to");
    QTest::newRow("service not there")
        << QStringLiteral("no service") << kSetters << QStringLiteral("was not kept");
    QTest::newRow("all locked") << QStringLiteral("locked") << kSetters << QStringLiteral("is locked");
}

void TestLibveskmde::tellsWhatFailed()
{
    QFETCH(QString, state);
    QFETCH(QStringList, failed);
    QFETCH(QString, reason);
    Surroundings surroundings;

    QByteArray schema = schemaText();
    if (state == QStringLiteral("older schema"))
        schema.replace("launcher-displayed", "launcher-shown");
    if (state == QStringLiteral("other type"))
        schema.replace("\"launcher-displayed\" type=\"b\">\n      <default>true",
                       "\"launcher-displayed\" type=\"i\">\n      <default>1");
    if (state != QStringLiteral("no schema"))
        QVERIFY(surroundings.installSchema(schema));
    if (state == QStringLiteral("memory"))
        surroundings.set("GSETTINGS_BACKEND", QStringLiteral("memory"));
    if (state == QStringLiteral("no place"))
        surroundings.set("XDG_CONFIG_HOME", QStringLiteral("/dev/null/config"));
    if (state == QStringLiteral("no service"))
        QVERIFY(surroundings.useDconf(QByteArray()));
    if (state == QStringLiteral("locked"))
        QVERIFY(surroundings.useDconf(locksOnAllKeys()));

    const Outcome outcome = surroundings.callSetters({QStringLiteral("0"), QStringLiteral("display")});
    QCOMPARE(outcome.exitCode, 0);
    QCOMPARE(outcome.failedSetters(), failed);
    QCOMPARE(outcome.warnings.size(), failed.size());
    for (int i = 0; i < failed.size(); ++i) {
        QVERIFY2(outcome.warnings.at(i).startsWith(failed.at(i)), qPrintable(outcome.warnings.at(i)));
        QVERIFY2(outcome.warnings.at(i).contains(reason), qPrintable(outcome.warnings.at(i)));
        const QString result = outcome.results.value(failed.at(i));
        QVERIFY2(result == QStringLiteral("false") || outcome.warnings.at(i).endsWith(result),
                 qPrintable(result));
    }
}

QTEST_GUILESS_MAIN(TestLibveskmde)
#include "tst_libveskmde.moc"
