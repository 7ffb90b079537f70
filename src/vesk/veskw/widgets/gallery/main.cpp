// SPDX-License-Identifier: Apache-2.0
#include "formsheet.h"
#include "mtk/mapplication.h"

#include <QCommandLineParser>
#include <QDebug>
#include <QDir>
#include <QTimer>

namespace {

constexpr int kSettleTime = 500; // milliseconds until nothing moves any more

bool writePicture(const FormSheet &sheet, const QString &folder)
{
    const QString path = QDir(folder).filePath(QStringLiteral("forms.png"));
    if (QDir().mkpath(folder) && sheet.picture().save(path))
        return true;
    qCritical().noquote() << "Cannot write" << path;
    return false;
}

} // namespace

int main(int argc, char **argv)
{
    Mtk::Widget::MApplication application(argc, argv);
    QCommandLineParser parser;
    parser.setApplicationDescription(FormSheet::tr("Shows each form row in each of its states."));
    parser.addHelpOption();
    const QCommandLineOption picture(
        QStringLiteral("picture"), FormSheet::tr("Write a picture into DIR and end."), QStringLiteral("DIR"));
    parser.addOption(picture);
    parser.process(application);

    FormSheet sheet;
    sheet.show();
    if (parser.isSet(picture)) {
        QTimer::singleShot(kSettleTime, &sheet, [&] {
            QCoreApplication::exit(writePicture(sheet, parser.value(picture)) ? 0 : 1);
        });
    }
    return QCoreApplication::exec();
}
