// SPDX-License-Identifier: Apache-2.0
#include "exchangemodule.h"

#include <QFile>
#include <QFileInfo>
#include <QLibrary>
#include <QMutex>

#include <dlfcn.h>

namespace {

const char kAnchor = 0;

// "httpclientapi-0/libhttpclientapi-curl.so" beside the library that this source is part of.
QString modulePath()
{
    Dl_info library = {};
    if (::dladdr(&kAnchor, &library) == 0)
        return {};
    return QFileInfo(QFile::decodeName(library.dli_fname)).canonicalPath() +
           QStringLiteral("/httpclientapi-0/libhttpclientapi-curl.so");
}

ExchangeFunction load(QString *error)
{
    QLibrary module(modulePath());
    module.setLoadHints(QLibrary::ResolveAllSymbolsHint | QLibrary::PreventUnloadHint);
    const auto prepare = reinterpret_cast<PrepareFunction>(module.resolve(kPrepareSymbol));
    const ExchangeFunction exchange = prepare != nullptr ? prepare() : nullptr;
    if (!module.isLoaded())
        *error = QStringLiteral("module not loaded: ") + module.errorString();
    else if (exchange == nullptr)
        *error = QStringLiteral("module not usable: ") + module.fileName();
    return exchange;
}

} // namespace

ExchangeFunction exchangeFunction(QString *error)
{
    static QMutex mutex;
    static ExchangeFunction loaded = nullptr;
    const QMutexLocker locker(&mutex);
    if (loaded == nullptr)
        loaded = load(error);
    return loaded;
}
