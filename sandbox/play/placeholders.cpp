// SPDX-License-Identifier: Apache-2.0
#include "play/placeholders.h"

#include "certificateauthority.h"
#include "journal/smallfile.h"

#include <QJsonDocument>

namespace sandbox {

std::optional<QJsonObject> Placeholders::fill(const QJsonObject &object, QString *error) const
{
    QByteArray text = QJsonDocument(object).toJson(QJsonDocument::Compact);
    if (!text.contains("{ca}") && !text.contains("{cert}") && !text.contains("key}"))
        return object;
    const auto authority =
        CertificateAuthority::load(m_state.at("server/ca.crt"), m_state.at("server/ca.key"), error);
    const QByteArray machine = smallfile::read(m_state.inside(QStringLiteral("/usr/share/vesk/machine.txt")))
                                   .value_or(QByteArray())
                                   .trimmed();
    const auto pair = authority ? authority->issueClient(QString::fromUtf8(machine), error) : std::nullopt;
    const auto other = authority ? authority->issueClient(QString::fromUtf8(machine), error) : std::nullopt;
    if (!pair || !other)
        return std::nullopt;
    text.replace("{ca}", authority->certificatePem().toBase64());
    text.replace("{cert}", pair->certificatePem.toBase64());
    text.replace("{key}", pair->keyPem.toBase64());
    text.replace("{other_key}", other->keyPem.toBase64());
    return QJsonDocument::fromJson(text).object();
}

} // namespace sandbox
