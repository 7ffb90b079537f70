// SPDX-License-Identifier: Apache-2.0
// Shows every widget of the toolkit in every state.
#include "gallerywindow.h"
#include "screenshots.h"

#include "mtk/mapplication.h"

#include <QCommandLineParser>

int main(int argc, char **argv)
{
    Mtk::Widget::MApplication application(argc, argv);
    QCommandLineParser parser;
    parser.setApplicationDescription(QStringLiteral("Shows every widget of the toolkit in every state."));
    parser.addHelpOption();
    const QCommandLineOption screenshots(QStringLiteral("picture"),
                                         QStringLiteral("Write one PNG file for each section and exit."),
                                         QStringLiteral("directory"));
    parser.addOption(screenshots);
    parser.process(application);
    if (parser.isSet(screenshots))
        return Gallery::writeScreenshots(parser.value(screenshots)) ? 0 : 1;

    Gallery::GalleryWindow window;
    window.show();
    return Mtk::Widget::MApplication::exec();
}
