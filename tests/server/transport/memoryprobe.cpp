// SPDX-License-Identifier: Apache-2.0
// Sends a secret in a POST: memory-probe URL CA-FILE. Prints the status and how often the secret is in the
// memory of this process afterwards, as UTF-8 or as UTF-16.
#include "httpclientapi.h"

#include <array>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <vector>

namespace {

constexpr unsigned char kMask = 0x55;
constexpr std::uintptr_t kMaxRegion = std::uintptr_t(1) << 30; // larger ones are the sanitizer's shadow
// The secret is nowhere in clear, but where the text of the request is made.
constexpr std::array<unsigned char, 12> kMasked = {0x16, 0x34, 0x3b, 0x34, 0x27, 0x2c,
                                                   0x78, 0x6c, 0x6d, 0x62, 0x63, 0x60};

struct Region
{
    std::uintptr_t start = 0;
    std::uintptr_t end = 0;
};

std::vector<Region> writableRegions()
{
    std::vector<Region> regions;
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        Region region;
        if (std::sscanf(line.c_str(), "%lx-%lx rw", &region.start, &region.end) == 2 &&
            line.find(" rw") != std::string::npos && region.end - region.start < kMaxRegion)
            regions.push_back(region);
    }
    return regions;
}

// The bytes are looked at where they are: a buffer for them would be another copy.
__attribute__((no_sanitize("address", "undefined"), noinline)) bool
holdsSecret(const volatile unsigned char *bytes, std::size_t distance)
{
    for (std::size_t i = 0; i < kMasked.size(); ++i) {
        if ((bytes[i * distance] ^ kMask) != kMasked[i])
            return false;
    }
    return true;
}

__attribute__((no_sanitize("address", "undefined"), noinline)) int countSecrets()
{
    int count = 0;
    for (const Region &region : writableRegions()) {
        for (std::uintptr_t at = region.start; at + 2 * kMasked.size() <= region.end; ++at) {
            const auto *bytes = reinterpret_cast<const volatile unsigned char *>(at);
            if (*bytes == (kMasked[0] ^ kMask) && (holdsSecret(bytes, 1) || holdsSecret(bytes, 2)))
                ++count;
        }
    }
    return count;
}

QString secretBody()
{
    QString body = QStringLiteral("{\"password\":\"............\"}");
    QChar *place = body.data() + body.indexOf(QLatin1Char('.'));
    for (const unsigned char masked : kMasked)
        *place++ = QLatin1Char(static_cast<char>(masked ^ kMask));
    return body;
}

} // namespace

int main(int argc, char **argv)
{
    if (argc != 3)
        return 2;
    HttpClientApi client(nullptr, false);
    client.setSSLConfig(QString::fromLocal8Bit(argv[2]), QString(), QString());
    QString body = secretBody();
    const int before = countSecrets();
    QString reply;
    const int status = client.postRequest(reply, QString::fromLocal8Bit(argv[1]), body, true);
    body.fill(QLatin1Char('x'));
    std::printf("%d %d %d\n", before, status, countSecrets());
    return 0;
}
