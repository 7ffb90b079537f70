// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <qglobal.h>

// Marks what a program may use; all other symbols of the library are hidden.
#if defined(MTK_LIBRARY)
#define MTK_EXPORT Q_DECL_EXPORT
#else
#define MTK_EXPORT Q_DECL_IMPORT
#endif
