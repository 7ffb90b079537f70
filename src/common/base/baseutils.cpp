// SPDX-License-Identifier: Apache-2.0
#include "baseutils.h"

namespace vesk {
namespace base {

template bool BaseUtils::getJsonObjectValue<bool>(const QJsonObject &, const QString &, bool &,
                                                  const QString &);
template bool BaseUtils::getJsonObjectValue<QString>(const QJsonObject &, const QString &, QString &,
                                                     const QString &);

} // namespace base
} // namespace vesk
