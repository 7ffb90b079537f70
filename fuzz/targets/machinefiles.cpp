// SPDX-License-Identifier: Apache-2.0
// The small files of the machine, and what becomes of them in requests.
#include "backupconfig.h"
#include "fileconfig.h"
#include "filecontent.h"
#include "httprequest.h"
#include "programfiles.h"
#include "require.h"
#include "scriptedtransport.h"
#include "targets.h"
#include "wellknownpaths.h"

#include <QDateTime>
#include <QFile>
#include <QUrl>
#include <QUrlQuery>

using vesk::base::FileContent;

namespace fuzz {

namespace {

// Settings are read again only when the file looks changed; two inputs may have one length and one
// millisecond.
void makeNewer(const QString &path)
{
    static QDateTime time = QDateTime::currentDateTime();
    time = time.addSecs(1);
    QFile file(path);
    require(file.open(QIODevice::ReadWrite) && file.setFileTime(time, QFileDevice::FileModificationTime),
            "a file of the isolated view can be dated");
}

} // namespace

void machineFile(const QByteArray &input)
{
    programfiles::write(QString::fromUtf8(vesk::kMachineidPath), input);
    bool ok = false;
    const QString identity = FileContent::instace()->getMachineID(&ok, true);
    require(ok, "a regular file is read");
    require(!identity.contains(QChar(0)), "an identity ends at the first NUL");
    // The bytes are trimmed, and a mark at their beginning goes when they become text.
    const bool isMarked = input.trimmed().startsWith("\xef\xbb\xbf");
    require(isMarked || identity.isEmpty() || !identity.at(0).isSpace() || identity.at(0).unicode() > 127,
            "an identity begins with no white space");

    FileConfig::GetInstance()->setDomainHost(QStringLiteral("uim.example"));
    FileConfig::GetInstance()->setDomainPort(QStringLiteral("8443"));
    HttpRequest::GetInstance()->getMacheineCheck(MachineJoin, QString());
    const QUrlQuery query(QUrl(scriptedtransport::state().calls.first().url));
    require(query.queryItems().size() == 2, "an identity adds no item to a request");
    require(query.queryItemValue(QStringLiteral("keyword")) == QLatin1String("join"),
            "an identity changes no other item of a request");
}

void hostNameFile(const QByteArray &input)
{
    programfiles::write(QStringLiteral("/etc/hostname"), input);
    QFile::remove(QString::fromUtf8(vesk::kUserinfoPath));
    FileConfig config(nullptr);
    require(config.readTerminalName() == config.readHostName(),
            "without a record the host name is the alias");
    require(!config.readTerminalName().contains(QLatin1Char('\n')), "a host name is one line");
}

void backupConfig(const QByteArray &input)
{
    const QString path = QString::fromUtf8(vesk::kBackupConfigPath);
    programfiles::write(path, input);
    makeNewer(path);
    const QStringList list = backupconfig::controlCenterList();
    makeNewer(path);
    require(backupconfig::controlCenterList() == list, "a file reads the same twice");
    require(isolatedfiles::read(path) == input, "the file is only read");
}

} // namespace fuzz
