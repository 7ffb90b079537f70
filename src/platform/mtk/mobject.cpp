// SPDX-License-Identifier: Apache-2.0
#include "mobject.h"

namespace Mtk::Core {

MObject::MObject() = default;
MObject::~MObject() = default;

} // namespace Mtk::Core
