// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QDBusConnection>
#include <QDeadlineTimer>
#include <QString>
#include <QVariantList>

#include <vector>

namespace sandbox {

/// One object on the accessibility bus. The path alone tells two message boxes with the same words apart.
struct ObjectRef
{
    QString service;
    QString path;

    bool operator==(const ObjectRef &other) const { return service == other.service && path == other.path; }
};

/// The one door to D-Bus: announces an assistive technology on the session bus, as a screen reader does,
/// finds the accessibility bus and sends calls there. AccessibleTree uses it. It knows nothing of pages and
/// widgets.
///
/// Opening throws a Trouble that says which bus is missing. A call waits 2 seconds at most, since the program
/// may be busy with a call of its own, and throws Vanished when no answer came or the answer is an error.
class AccessibleBus
{
public:
    AccessibleBus();
    ~AccessibleBus();
    AccessibleBus(const AccessibleBus &) = delete;
    AccessibleBus &operator=(const AccessibleBus &) = delete;

    QVariantList call(const ObjectRef &object, const QString &interface, const QString &method,
                      const QVariantList &arguments = {}) const;
    QVariant property(const ObjectRef &object, const QString &interface, const QString &name) const;
    std::vector<ObjectRef> children(const ObjectRef &object) const;

    /// Sends the call once and waits until the program has taken it, but no longer than the deadline. What
    /// comes of it is for the caller to see.
    void deliver(const ObjectRef &object, const QString &interface, const QString &method,
                 const QVariantList &arguments, const QDeadlineTimer &deadline) const;

    /// Whether the process behind `service` is still connected.
    bool isAlive(const QString &service) const;

    /// The applications that publish a tree, in the order in which they came.
    std::vector<ObjectRef> applications() const;

private:
    QDBusConnection m_bus;
};

} // namespace sandbox
