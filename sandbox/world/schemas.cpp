// SPDX-License-Identifier: Apache-2.0
#include "schemas.h"

#include "journal/smallfile.h"
#include "process.h"

#include <QCoreApplication>
#include <QDir>
#include <QDomDocument>

#include <algorithm>

namespace sandbox {

namespace {

constexpr int kTimeoutMs = 20000;

QString sourceDirectory()
{
    const QString beside =
        QCoreApplication::applicationDirPath() + QStringLiteral("/../share/vesk-sandbox/schemas");
    return QDir(beside).exists() ? beside : QStringLiteral(VESK_SCHEMA_DIRECTORY);
}

void dropKeys(QDomDocument *schema, const QStringList &names)
{
    const QDomNodeList keys = schema->elementsByTagName(QStringLiteral("key"));
    for (int i = keys.size() - 1; i >= 0; --i) {
        const QDomNode key = keys.at(i);
        if (names.contains(key.toElement().attribute(QStringLiteral("name"))))
            key.parentNode().removeChild(key);
    }
}

bool copySchema(const QString &from, const QString &to, const QStringList &without, QString *error)
{
    const std::optional<QByteArray> source = smallfile::read(from, error);
    QDomDocument schema;
    if (!source)
        return false;
    if (!schema.setContent(*source)) {
        *error = QStringLiteral("%1 is no settings schema").arg(from);
        return false;
    }
    dropKeys(&schema, without);
    return smallfile::write(to, schema.toByteArray(), FileAccess::Everyone, error);
}

bool runCompiler(const QString &directory, QString *error)
{
    vesk::base::Process compiler;
    if (compiler.run(QStringLiteral("glib-compile-schemas"), {QStringLiteral("--strict"), directory},
                     kTimeoutMs) &&
        compiler.exitStatus() == QProcess::NormalExit && compiler.exitCode() == 0)
        return true;
    const QString said = QString::fromLocal8Bit(compiler.readAllStandardError()).trimmed();
    *error =
        QStringLiteral("glib-compile-schemas fails: %1").arg(said.isEmpty() ? compiler.errorString() : said);
    return false;
}

} // namespace

bool compileSchemas(const QString &directory, const QStringList &without, QString *error)
{
    const QDir source(sourceDirectory());
    const QStringList files = source.entryList({QStringLiteral("*.gschema.xml")}, QDir::Files);
    if (files.isEmpty())
        *error = QStringLiteral("no settings schema in %1").arg(source.path());
    const bool good = std::all_of(files.begin(), files.end(), [&](const QString &file) {
        return copySchema(source.filePath(file), directory + QLatin1Char('/') + file, without, error);
    });
    return good && !files.isEmpty() && runCompiler(directory, error);
}

} // namespace sandbox
