// SPDX-License-Identifier: Apache-2.0
#include "schemas.h"

#include "journal/error.h"
#include "journal/smallfile.h"
#include "process.h"

#include <QCoreApplication>
#include <QDir>
#include <QDomDocument>

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

void copySchema(const QString &from, const QString &to, const QStringList &without)
{
    QDomDocument schema;
    if (!schema.setContent(smallfile::load(from)))
        throw Error(QStringLiteral("%1 is no settings schema").arg(from));
    dropKeys(&schema, without);
    smallfile::save(to, schema.toByteArray());
}

void runCompiler(const QString &directory)
{
    vesk::base::Process compiler;
    if (compiler.run(QStringLiteral("glib-compile-schemas"), {QStringLiteral("--strict"), directory},
                     kTimeoutMs) &&
        compiler.exitStatus() == QProcess::NormalExit && compiler.exitCode() == 0)
        return;
    const QString said = QString::fromLocal8Bit(compiler.readAllStandardError()).trimmed();
    throw Error(
        QStringLiteral("glib-compile-schemas fails: %1").arg(said.isEmpty() ? compiler.errorString() : said));
}

} // namespace

void compileSchemas(const QString &directory, const QStringList &without)
{
    const QDir source(sourceDirectory());
    const QStringList files = source.entryList({QStringLiteral("*.gschema.xml")}, QDir::Files);
    if (files.isEmpty())
        throw Error(QStringLiteral("no settings schema in %1").arg(source.path()));
    for (const QString &file : files)
        copySchema(source.filePath(file), directory + QLatin1Char('/') + file, without);
    runCompiler(directory);
}

} // namespace sandbox
