// SPDX-License-Identifier: Apache-2.0
// The terminal record, through both of its readers and all of its writers.
#include "fileconfig.h"
#include "filecontent.h"
#include "programfiles.h"
#include "require.h"
#include "targets.h"
#include "wellknownpaths.h"

#include <algorithm>

using vesk::base::FileContent;
using vesk::base::UserInfo;

namespace fuzz {

namespace {

QString recordPath()
{
    return QString::fromUtf8(vesk::kUserinfoPath);
}

QStringList fieldsOf(FileConfig &config)
{
    return {
        config.readServerHost(),   config.readServerPort(),
        config.readDomainHost(),   config.readDomainPort(),
        config.readTerminalName(), config.readIsDomain() ? QStringLiteral("joined") : QStringLiteral("free")};
}

QStringList fieldsOf(const UserInfo &info)
{
    return {info.serverHost,   info.serverPort,
            info.domainHost,   info.domainPort,
            info.terminalName, info.isDomain ? QStringLiteral("joined") : QStringLiteral("free")};
}

// Half a surrogate pair, which JSON can spell, is no text and comes back from a file as something else.
bool isSame(const QStringList &first, const QStringList &second)
{
    const auto isSameText = [](const QString &one, const QString &other) {
        return one == other ||
               std::any_of(one.begin(), one.end(), [](QChar each) { return each.isSurrogate(); });
    };
    return std::equal(first.begin(), first.end(), second.begin(), second.end(), isSameText);
}

// A loaded record that is staged and installed loads as the same.
void checkRoundTrip(const QByteArray &input)
{
    programfiles::write(recordPath(), input);
    FileConfig loaded(nullptr);
    loaded.writeServerConfig();
    programfiles::write(recordPath(), programfiles::stagedRecord());
    FileConfig again(nullptr);
    require(isSame(fieldsOf(loaded), fieldsOf(again)), "a staged record reads back equal");
}

void checkFlag(const QByteArray &input)
{
    programfiles::write(recordPath(), input);
    bool known = true;
    FileContent::isDomain(&known);
    if (FileContent::saveDomain(true)) {
        require(known, "the flag is only set in a record that has it");
        require(FileConfig(nullptr).readIsDomain(), "a saved flag reads back");
    } else {
        require(isolatedfiles::read(recordPath()) == input, "a record without the flag is left alone");
    }
}

void checkWholeRecord(const QByteArray &input)
{
    programfiles::write(recordPath(), input);
    const UserInfo info = FileContent::getUserInfo(nullptr);
    const QStringList repaired = fieldsOf(FileContent::getUserInfo(nullptr));
    require(isSame(fieldsOf(info), repaired), "a repaired record says the same");
    require(FileContent::saveUserInfo(info), "a record can be saved");
    bool complete = false;
    require(isSame(fieldsOf(info), fieldsOf(FileContent::getUserInfo(&complete))),
            "a record reads back equal");
    require(complete, "a saved record is complete");
}

void checkOneKey(const QByteArray &input)
{
    programfiles::write(recordPath(), input);
    const QString alias = QStringLiteral("终端-1");
    require(vesk::base::updateUserInfo(QStringLiteral("terminal_name"), alias), "one key can be set");
    require(FileContent::getTerminalAlias(nullptr) == alias, "a key that was set reads back");
    QString host;
    QString port;
    FileContent::getHostAndPort(host, port);
}

} // namespace

void recordFile(const QByteArray &input)
{
    checkRoundTrip(input);
    checkFlag(input);
    checkWholeRecord(input);
    checkOneKey(input);
}

} // namespace fuzz
