// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "service.h"

#include <QDBusVirtualObject>

namespace sandbox {

class IamObject;

// The identity service: one property, kept in the state directory. It answers for itself where an adaptor
// could not: a write of the property can be refused with an error, and the property can be missing in the
// introspection.
class IamService : public Service
{
    Q_OBJECT

public:
    IamService(const StateDirectory &state, const QJsonObject &script);
    ~IamService() override;
    bool publish(QDBusConnection bus) override;

    // Inner part of the node's introspection, from the contract.
    QString interfaceXml() const;
    bool isEnabled() const;
    // A write that came on this bus. Name of the error with which it is refused; nothing: it is done.
    std::optional<QString> setEnabled(bool enabled, const QDBusConnection &bus);

private:
    std::unique_ptr<IamObject> m_object;
};

} // namespace sandbox
