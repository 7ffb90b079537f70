// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QVariantList>

namespace sandbox {

/// One object on the accessibility bus. The path alone tells two message boxes with the same words apart.
struct ObjectRef
{
    QString service;
    QString path;

    bool operator==(const ObjectRef &other) const { return service == other.service && path == other.path; }
};

/// The one way to the accessibility bus, and to the session bus that tells where it is, for all who read the
/// windows of a program or switch that on. It knows nothing of pages and widgets. The constructor throws an
/// Error when nothing listens at the address.
class AccessibleBus
{
public:
    /// limitMs: how long a call waits, since the program may be at work.
    explicit AccessibleBus(const QString &address, int limitMs = 2000);
    ~AccessibleBus();
    Q_DISABLE_COPY_MOVE(AccessibleBus)

    /// On a session bus: announces a screen reader, as one does itself when it starts;
    /// toolkits publish their windows only then. Gives the address of the accessibility bus, which is started
    /// if need be; throws Vanished while that session has none.
    ///
    /// To be done before a Qt 5 program starts, on a display that keeps its marks (`Xvfb -noreset`): the
    /// launcher of the bus writes the address to the root window. A program that finds it nowhere but on the
    /// session bus may publish before it is connected, and then never does.
    QString switchOn() const;

    /// The first value of the answer; throws Vanished when none came in time or it is an error.
    QVariant call(const ObjectRef &object, const QString &interface, const QString &method,
                  const QVariantList &arguments = {}) const;
    QVariant property(const ObjectRef &object, const QString &interface, const QString &name) const;
    QList<ObjectRef> children(const ObjectRef &object) const;
    QString name(const ObjectRef &object) const;

    /// The running programs that present themselves by this name, in the order in which they came.
    QList<ObjectRef> programs(const QString &name) const;

    /// The answer, whatever it is.
    QDBusMessage send(const ObjectRef &object, const QString &interface, const QString &method,
                      const QVariantList &arguments, int limitMs) const;

    /// Whether the process behind `service` is still connected.
    bool isAlive(const QString &service) const;

private:
    /// A question to the bus itself, and its answer.
    void exchange() const;

    QDBusConnection m_bus;
    int m_limitMs;
};

} // namespace sandbox

Q_DECLARE_METATYPE(sandbox::ObjectRef)
