// SPDX-License-Identifier: Apache-2.0
#include "mobject.h"

namespace Mtk {
namespace Core {

MObject::MObject() = default;
MObject::~MObject() = default;

} // namespace Core
} // namespace Mtk
