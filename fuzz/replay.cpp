// SPDX-License-Identifier: Apache-2.0
// Runs a target over the files of a folder, once each, without libFuzzer.
#include "session.h"

#include <QDir>
#include <QFile>

#include <cstdio>

int main(int argc, char **argv)
{
    const fuzz::Target target = fuzz::openSession(argc, argv);
    const QDir corpus(QFile::decodeName(argc > 1 ? argv[1] : ""));
    const QStringList names = corpus.entryList(QDir::Files, QDir::Name);
    if (argc != 2 || names.isEmpty()) {
        std::fprintf(stderr, "usage: fuzz-replay FOLDER\nThe folder must hold inputs.\n");
        return 2;
    }
    for (const QString &name : names) {
        QFile file(corpus.filePath(name));
        if (!file.open(QIODevice::ReadOnly)) {
            std::fprintf(stderr, "%s cannot be read\n", qPrintable(name));
            return 2;
        }
        std::printf("%s\n", qPrintable(name));
        std::fflush(stdout);
        fuzz::run(target, file.readAll());
    }
    return 0;
}
