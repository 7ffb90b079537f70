// SPDX-License-Identifier: Apache-2.0
#include "serverfixture.h"

#include "journal/error.h"

#include <QJsonDocument>

#include <curl/curl.h>

using namespace sandbox;

namespace {

constexpr long kTimeLimit = 30; // seconds

std::size_t collect(char *data, std::size_t size, std::size_t count, void *target)
{
    static_cast<QByteArray *>(target)->append(data, static_cast<int>(size * count));
    return size * count;
}

void setBlob(CURL *handle, CURLoption option, const QByteArray &bytes)
{
    curl_blob blob = {const_cast<char *>(bytes.constData()), static_cast<std::size_t>(bytes.size()),
                      CURL_BLOB_COPY};
    curl_easy_setopt(handle, option, &blob);
}

} // namespace

QJsonObject Answer::json() const
{
    return QJsonDocument::fromJson(body).object();
}

KeyPair Answer::pair() const
{
    const auto decoded = [&](const char *key) {
        return QByteArray::fromBase64(data().value(QLatin1String(key)).toString().toLatin1());
    };
    return {decoded("cert"), decoded("key")};
}

ServerFixture::ServerFixture(const QByteArray &server)
{
    write("scenario.json", R"({"title": "Server under test", "server": )" + server + '}');
    m_scenario = Scenario::load(path("scenario.json"));
}

QString ServerFixture::start()
{
    QString error;
    attempt(&error, [this] {
        m_server =
            std::make_unique<ManagementServer>(path("server"), m_scenario, Journal(path("journal.log")));
    });
    return error;
}

QByteArray ServerFixture::read(const char *file) const
{
    return smallfile::read(path(file)).value_or("");
}

bool ServerFixture::write(const char *file, const QByteArray &contents) const
{
    return smallfile::write(path(file), contents);
}

Answer ServerFixture::send(const char *method, const QByteArray &target, const QByteArray &body) const
{
    return sendAs({}, method, target, body);
}

Answer ServerFixture::sendAs(const KeyPair &pair, const char *method, const QByteArray &target,
                             const QByteArray &body) const
{
    const std::unique_ptr<CURL, decltype(&curl_easy_cleanup)> owner(curl_easy_init(), &curl_easy_cleanup);
    CURL *handle = owner.get();
    Answer answer;
    const bool isManaged = !pair.certificatePem.isEmpty();
    const int port = isManaged ? m_server->managedPort() : m_server->enrolmentPort();
    const QByteArray url = "https://127.0.0.1:" + QByteArray::number(port) + target;
    curl_easy_setopt(handle, CURLOPT_URL, url.constData());
    curl_easy_setopt(handle, CURLOPT_PROXY, "");
    curl_easy_setopt(handle, CURLOPT_CUSTOMREQUEST, method);
    curl_easy_setopt(handle, CURLOPT_TIMEOUT, kTimeLimit);
    curl_easy_setopt(handle, CURLOPT_NOSIGNAL, 1L);
    curl_easy_setopt(handle, CURLOPT_WRITEFUNCTION, collect);
    curl_easy_setopt(handle, CURLOPT_WRITEDATA, &answer.body);
    if (!body.isEmpty()) {
        curl_easy_setopt(handle, CURLOPT_POSTFIELDSIZE, static_cast<long>(body.size()));
        curl_easy_setopt(handle, CURLOPT_POSTFIELDS, body.constData());
    }
    setBlob(handle, CURLOPT_CAINFO_BLOB, read("server/ca.crt"));
    if (isManaged) {
        setBlob(handle, CURLOPT_SSLCERT_BLOB, pair.certificatePem);
        setBlob(handle, CURLOPT_SSLKEY_BLOB, pair.keyPem);
    }
    answer.curlCode = curl_easy_perform(handle);
    long status = 0;
    curl_easy_getinfo(handle, CURLINFO_RESPONSE_CODE, &status);
    answer.status = static_cast<int>(status);
    return answer;
}

Answer ServerFixture::join(const QByteArray &machineId, const QByteArray &name) const
{
    return send("POST", "/uim/v3/client/join",
                R"({"machine_id":")" + machineId + R"(","name":")" + name +
                    R"(","username":"liming","mac":"02:00:5e:10:00:01"})");
}

Answer ServerFixture::leave(const QByteArray &machineId, const KeyPair &pair) const
{
    const QByteArray body = R"({"machine_id":")" + machineId + R"(","username":"admin",)";
    sendAs(pair, "POST", "/uim/v3/client/remove_status", body + R"("password":"Control-9"})");
    return sendAs(pair, "POST", "/uim/v3/client/remove", body + R"("mac":""})");
}
