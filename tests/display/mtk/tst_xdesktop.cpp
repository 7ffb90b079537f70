// SPDX-License-Identifier: Apache-2.0
// What only a real X server shows: blur and compositing as window managers announce them, device pixels at
// the density of $SCREEN_DPI, and a start without OpenGL.
#include "mtk/mapplication.h"
#include "mtk/marrowrectangle.h"
#include "mtk/mblureffectwidget.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QBitmap>
#include <QFile>
#include <QLabel>
#include <QProcess>
#include <QScopeGuard>
#include <QScopedPointer>
#include <QScreen>
#include <QtTest>

#include <xcb/xcb.h>

using Mtk::Gui::MWindowManagerHelper;
using namespace Mtk::Widget;

namespace {

constexpr char kBlur[] = "_KDE_NET_WM_BLUR_BEHIND_REGION";
constexpr char kGlIntegration[] = "QT_XCB_GL_INTEGRATION";

// Device pixels for each of a program's own.
qreal screenDensity()
{
    return qEnvironmentVariableIntValue("SCREEN_DPI") / 96.0;
}

template <typename Type>
using Reply = QScopedPointer<Type, QScopedPointerPodDeleter>; // ends in free()

// The part of a window manager that announces what it can do.
class Manager
{
public:
    explicit Manager(bool composites = false, bool blurs = false)
        : m_connection(xcb_connect(nullptr, nullptr))
        , m_root(xcb_setup_roots_iterator(xcb_get_setup(m_connection)).data->root)
        , m_window(xcb_generate_id(m_connection))
    {
        xcb_create_window(m_connection, 0, m_window, m_root, 0, 0, 1, 1, 0, XCB_WINDOW_CLASS_INPUT_ONLY,
                          XCB_COPY_FROM_PARENT, 0, nullptr);
        if (composites)
            xcb_set_selection_owner(m_connection, m_window, atom("_NET_WM_CM_S0"), XCB_CURRENT_TIME);
        if (blurs)
            xcb_change_property(m_connection, XCB_PROP_MODE_REPLACE, m_root, atom(kBlur), XCB_ATOM_CARDINAL,
                                32, 0, nullptr);
        finish();
    }
    ~Manager()
    {
        xcb_delete_property(m_connection, m_root, atom(kBlur));
        finish();
        xcb_disconnect(m_connection);
    }
    Q_DISABLE_COPY(Manager)

    // As the desktop's settings tell programs that start.
    void tellDensity(const QByteArray &dpi) const
    {
        const QByteArray resources = "Xft.dpi:\t" + dpi + '\n';
        xcb_change_property(m_connection, XCB_PROP_MODE_REPLACE, m_root, XCB_ATOM_RESOURCE_MANAGER,
                            XCB_ATOM_STRING, 8, quint32(resources.size()), resources.constData());
        finish();
    }
    // In device pixels, like all that a window manager knows.
    QRegion blurOf(WId window) const
    {
        const auto cookie =
            xcb_get_property(m_connection, 0, xcb_window_t(window), atom(kBlur), XCB_ATOM_CARDINAL, 0, 4096);
        const Reply<xcb_get_property_reply_t> reply(xcb_get_property_reply(m_connection, cookie, nullptr));
        const auto *box = static_cast<const qint32 *>(xcb_get_property_value(reply.get()));
        QRegion region;
        for (quint32 i = 0; i + 4 <= reply->value_len; i += 4)
            region += QRect(box[i], box[i + 1], box[i + 2], box[i + 3]);
        return region;
    }

private:
    xcb_atom_t atom(const QByteArray &name) const
    {
        const auto cookie = xcb_intern_atom(m_connection, 0, quint16(name.size()), name.constData());
        return Reply<xcb_intern_atom_reply_t>(xcb_intern_atom_reply(m_connection, cookie, nullptr))->atom;
    }
    // Waits until the server has done all that was asked.
    void finish() const { atom("_NET_SUPPORTED"); }

    xcb_connection_t *m_connection;
    xcb_window_t m_root;
    xcb_window_t m_window;
};

} // namespace

class TestXDesktop : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void openGlIsLeftOut()
    {
        // Set for the platform plugin only; gone before the program could start a child that would inherit
        // it.
        QCOMPARE(qgetenv(kGlIntegration), QByteArray("none"));
        const QSignalSpy painted(qApp, SIGNAL(firstPainted()));
        QWidget window;
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        QTRY_VERIFY(!qEnvironmentVariableIsSet(kGlIntegration));
        QCOMPARE(painted.count(), 1);
        QFile maps(QStringLiteral("/proc/self/maps"));
        QVERIFY(maps.open(QIODevice::ReadOnly));
        QVERIFY(!maps.readAll().contains("xcbglintegrations"));
    }

    void announcedAbilities_data()
    {
        QTest::addColumn<bool>("composites");
        QTest::addColumn<bool>("blurs");
        QTest::addColumn<bool>("opaque");
        QTest::newRow("none") << false << false << false;
        QTest::newRow("compositing") << true << false << false;
        QTest::newRow("blur") << true << true << false;
        QTest::newRow("blur, for an opaque window") << true << true << true;
    }

    void announcedAbilities()
    {
        QFETCH(bool, composites);
        QFETCH(bool, blurs);
        QFETCH(bool, opaque);
        const Manager manager(composites, blurs);
        QCOMPARE(MWindowManagerHelper::instance()->hasComposite(), composites);
        QCOMPARE(MWindowManagerHelper::instance()->hasBlurWindow(), blurs);

        MBlurEffectWidget window;
        if (opaque)
            window.setMaskAlpha(255);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        QCOMPARE(window.testAttribute(Qt::WA_TranslucentBackground), composites);
        QCOMPARE(manager.blurOf(window.winId()).isEmpty(), opaque || !blurs);
    }

    // Frame and blur end at the same device pixels.
    void frameAndBlurFit()
    {
        const Manager manager(true, true);
        MBlurEffectWidget window;
        window.resize(380, 237);
        window.show();
        QVERIFY(QTest::qWaitForWindowExposed(&window));
        const QSize size = window.size() * screenDensity();
        const QRegion blur = manager.blurOf(window.winId());
        QCOMPARE(blur.boundingRect(), QRect(QPoint(), size));

        const QImage image = window.grab().toImage();
        QCOMPARE(image.size(), size);
        int differences = 0;
        for (int y = 0; y < size.height(); ++y) {
            for (int x = 0; x < size.width(); ++x)
                differences += blur.contains(QPoint(x, y)) != (qAlpha(image.pixel(x, y)) > 100) ? 1 : 0;
        }
        QVERIFY2(differences < 32 * screenDensity(), "the corners differ"); // but for smoothed edges
        int frame = 0;
        while (image.pixel(size.width() / 2, frame) == image.pixel(size.width() / 2, 0))
            ++frame;
        QCOMPARE(frame, int(screenDensity()));
    }

    // Without a compositor a popup is cut to its outline.
    void popupIsCut()
    {
        MArrowRectangle popup(MArrowRectangle::ArrowTop);
        popup.setContent(new QLabel(QStringLiteral("请输入管理员帐号")));
        popup.show(100, 50);
        const auto shape = [&popup] {
            const QPixmap screen = popup.screen()->grabWindow(0);
            return QRegion(screen.createMaskFromColor(Qt::black, Qt::MaskInColor));
        };
        // Edges may lie within a device pixel.
        const int slack = qCeil(screenDensity()) - qFloor(screenDensity());
        const QRect body = popup.geometry().adjusted(0, 1, 0, 0); // the tip ends in less than a pixel
        const QRect place(body.topLeft() * screenDensity(), body.size() * screenDensity());
        QTRY_VERIFY(shape().boundingRect().contains(place.adjusted(slack, slack, -slack, -slack)));
        QVERIFY(place.adjusted(-slack, -slack, slack, slack).contains(shape().boundingRect()));
        QVERIFY(!shape().contains(place.topLeft()) && !shape().contains(place.bottomRight()));
        QVERIFY(shape().contains(QPoint(100, 52) * screenDensity()));
    }
};

int main(int argc, char **argv)
{
    QProcess server;
    server.start(QStringLiteral("Xvfb"),
                 QStringLiteral("-displayfd 1 -screen 0 800x600x24 -nolisten tcp").split(QLatin1Char(' ')));
    const auto end = qScopeGuard([&server] {
        server.terminate();
        server.waitForFinished();
    });
    while (!server.canReadLine() && server.waitForReadyRead()) {
    }
    const QByteArray display = server.readLine().trimmed();
    if (display.isEmpty())
        qFatal("Xvfb did not start");
    qputenv("DISPLAY", ':' + display);
    qputenv("QT_QPA_PLATFORM", "xcb");
    const Manager manager;   // keeps what it tells on the server
    if (screenDensity() > 1) // otherwise the 100 that the server gives itself must not count
        manager.tellDensity(qgetenv("SCREEN_DPI"));
    MApplication application(argc, argv);
    TestXDesktop test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_xdesktop.moc"
