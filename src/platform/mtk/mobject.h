// SPDX-License-Identifier: Apache-2.0
#pragma once

#include "mtkglobal.h"

namespace Mtk::Core {

// Second base of the toolkit's classes: lets code that holds any object of the toolkit delete it without
// knowing its Qt class. Carries no state.
class MTK_EXPORT MObject
{
public:
    MObject(const MObject &) = delete;
    MObject &operator=(const MObject &) = delete;
    virtual ~MObject();

protected:
    MObject();
};

} // namespace Mtk::Core
