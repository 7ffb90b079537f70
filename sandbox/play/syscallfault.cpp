// SPDX-License-Identifier: Apache-2.0
#include "play/syscallfault.h"

#include "journal/error.h"
#include "journal/smallfile.h"
#include "scenario/json.h"

#include <QFileInfo>
#include <QRegularExpression>

namespace sandbox {

namespace {

constexpr int kAttachTimeoutMs = 20000;

// "17 kill(-1, SIGKILL) = ...": nobody is meant who may be hit.
bool isToMany(const QByteArray &line)
{
    const int target = line.indexOf(" kill(");
    return target >= 0 && line.mid(target + 6).split(',').first().toInt() <= 0;
}

} // namespace

SyscallFault::SyscallFault(StateDirectory state, QJsonObject fault)
    : m_state(std::move(state))
    , m_fault(std::move(fault))
    , m_strace({})
{
}

QString SyscallFault::moment() const
{
    return json::text(m_fault, "on");
}

// No text of a call is recorded but names of files: there may be secrets in it.
QStringList SyscallFault::options() const
{
    const QString call = json::text(m_fault, "call");
    const QString prefix =
        QFileInfo(QCoreApplication::applicationDirPath() + QStringLiteral("/..")).canonicalFilePath();
    const QString fault =
        QStringLiteral("inject=%1:error=%2:when=%3%4")
            .arg(call, json::text(m_fault, "error"), QString::number(json::number(m_fault, "nth", 1)),
                 QLatin1String(json::flag(m_fault, "every") ? "+" : ""));
    QStringList result =
        QStringLiteral("-f -s 0 -e signal=none -e inject=kill:error=EPERM -e trace=kill,%1 -e %2 -o")
            .arg(call, fault)
            .split(QLatin1Char(' '));
    result << m_state.calls();
    for (const QString &path : json::texts(m_fault, "paths"))
        result << QStringLiteral("-P")
               << QString(path)
                      .replace(QLatin1String("{commands}"), m_state.commands())
                      .replace(QLatin1String("{prefix}"), prefix);
    return result;
}

// A leak sanitizer, where there is one, cannot do its work in a traced process.
QStringList SyscallFault::startOf(const QStringList &command) const
{
    if (m_fault.isEmpty())
        return command;
    const QString sanitizer =
        QStringLiteral("ASAN_OPTIONS=%1:detect_leaks=0").arg(qEnvironmentVariable("ASAN_OPTIONS"));
    if (!moment().isEmpty())
        return QStringList{QStringLiteral("env"), sanitizer} + command;
    return QStringList{QStringLiteral("strace"), QStringLiteral("--seccomp-bpf"), QStringLiteral("-E"),
                       sanitizer} +
           options() + command;
}

void SyscallFault::attach(pid_t program)
{
    m_strace.setReadChannel(QProcess::StandardError);
    m_strace.start(QStringLiteral("strace"),
                   options() + QStringList{QStringLiteral("-p"), QString::number(program)});
    QByteArray said; // it may have something to say of paths first
    while (!said.contains(" attached")) {
        if (!m_strace.waitForReadyRead(kAttachTimeoutMs))
            throw Error(QStringLiteral("strace does not attach: %1").arg(QString::fromLocal8Bit(said)));
        said += m_strace.readAll();
    }
}

void SyscallFault::detach()
{
    m_strace.end();
}

QStringList SyscallFault::complaints() const
{
    if (m_fault.isEmpty())
        return {};
    const QByteArray record = smallfile::read(m_state.calls()).value_or(QByteArray());
    QStringList result;
    for (const QByteArray &line : record.split('\n')) {
        if (isToMany(line))
            result.append(QStringLiteral("a signal to more than one process: %1")
                              .arg(QString::fromUtf8(line.simplified())));
    }
    static const QRegularExpression struck(QStringLiteral("^(\\d+ +)?(?!kill|\\d).* \\(INJECTED\\)$"),
                                           QRegularExpression::MultilineOption);
    if (!struck.match(QString::fromUtf8(record)).hasMatch())
        result.append(QStringLiteral("the call that was to fail was not made"));
    return result;
}

} // namespace sandbox
