// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "logtext.h"

#include <QJsonObject>
#include <QString>
#include <QVariant>

#include <QDebug>

namespace vesk::base {

// What the readers of the base layer share: logging in one form, and JSON access that says what is missing.
class BaseUtils
{
public:
    BaseUtils() {}

    // Logs that a file could not be opened. func: short name of the operation that wanted it.
    static void openFailedLog(const QString &func) { qWarning().noquote() << func << "open file failed!"; }

    // Takes the value of `key` out of `object` into `value`, converted as QVariant converts; a value that
    // cannot be converted becomes the default of T. Returns false, logs a warning that begins with `func` and
    // leaves `value` alone when the key is absent.
    template <typename T>
    static bool getJsonObjectValue(const QJsonObject &object, const QString &key, T &value,
                                   const QString &func)
    {
        if (!object.contains(key)) {
            qWarning().noquote() << func << "can not get json key:" << logText(key);
            return false;
        }
        value = object.value(key).toVariant().value<T>();
        return true;
    }
};

} // namespace vesk::base
