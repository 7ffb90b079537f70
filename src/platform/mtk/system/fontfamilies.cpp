// SPDX-License-Identifier: Apache-2.0
#include "fontfamilies.h"

#include <QMap>
#include <QVector>

#include <algorithm>
#include <iterator>

#include <fontconfig/fontconfig.h>

namespace Mtk {

namespace {

// Families of the same shapes, the best first; then spellings of theirs in programs of the desktop.
const char *const kNames[] = {"Source Han Sans CN",     "Source Han Sans SC",
                              "Noto Sans CJK SC",       "Source Han Sans CN-Normal;",
                              "SourceHanSansSC-Normal", "SourceHanSansCN-Medium"};

const FcChar8 *bytes(const char *name)
{
    return reinterpret_cast<const FcChar8 *>(name);
}

// By place in kNames.
QMap<int, QVector<FcPattern *>> facesIn(const FcFontSet &fonts)
{
    QMap<int, QVector<FcPattern *>> faces;
    FcChar8 *family = nullptr;
    for (int font = 0; font < fonts.nfont; ++font) {
        FcPattern *face = fonts.fonts[font];
        for (int i = 0; FcPatternGetString(face, FC_FAMILY, i, &family) == FcResultMatch; ++i) {
            const auto *name = std::find_if(std::begin(kNames), std::end(kNames), [family](const char *each) {
                return FcStrCmpIgnoreCase(family, bytes(each)) == 0;
            });
            if (name != std::end(kNames))
                faces[int(name - std::begin(kNames))].append(face);
        }
    }
    return faces;
}

} // namespace

void FontFamilies::complete()
{
    FcFontSet *fonts = FcConfigGetFonts(nullptr, FcSetSystem);
    const QMap<int, QVector<FcPattern *>> faces = fonts ? facesIn(*fonts) : QMap<int, QVector<FcPattern *>>();
    if (faces.isEmpty())
        return;
    for (const FcPattern *face : faces.first()) {
        FcPattern *twin = FcPatternDuplicate(face);
        FcPatternDel(twin, FC_FAMILY);
        FcPatternDel(twin, FC_FAMILYLANG);
        for (size_t name = 0; name < std::size(kNames); ++name) {
            if (!faces.contains(int(name)))
                FcPatternAddString(twin, FC_FAMILY, bytes(kNames[name]));
        }
        FcFontSetAdd(fonts, twin);
    }
}

} // namespace Mtk
