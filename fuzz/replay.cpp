// SPDX-License-Identifier: Apache-2.0
// Runs a target over the files of a directory, once each, without libFuzzer.
#include "journal/smallfile.h"
#include "session.h"

#include <QDir>

#include <cstdio>

int main(int argc, char **argv)
{
    const fuzz::Target target = fuzz::openSession(argc, argv);
    const QDir corpus(QFile::decodeName(argc > 1 ? argv[1] : ""));
    const QStringList names = corpus.entryList(QDir::Files, QDir::Name);
    if (argc != 2 || names.isEmpty()) {
        std::fprintf(stderr, "usage: fuzz-replay DIRECTORY\nThe directory must hold inputs.\n");
        return 2;
    }
    for (const QString &name : names) {
        std::printf("%s\n", qPrintable(name));
        std::fflush(stdout);
        fuzz::run(target, sandbox::smallfile::read(corpus.filePath(name)).value());
    }
    return 0;
}
