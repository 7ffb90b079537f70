// SPDX-License-Identifier: Apache-2.0
// What only a real X server shows: blur and compositing as window managers announce them, and a start without
// OpenGL.
#include "xserver.h"

#include "mtk/mapplication.h"
#include "mtk/mblureffectwidget.h"
#include "mtk/mwindowmanagerhelper.h"

#include <QFile>
#include <QtTest>

#include <cstdlib>

#include <xcb/xcb.h>

using Mtk::Gui::MWindowManagerHelper;
using namespace Mtk::Widget;

namespace {

constexpr char kBlur[] = "_KDE_NET_WM_BLUR_BEHIND_REGION";
constexpr char kGlIntegration[] = "QT_XCB_GL_INTEGRATION";

// The part of a window manager that announces what it can do.
class Manager
{
public:
    Manager()
        : m_connection(xcb_connect(nullptr, nullptr))
        , m_root(xcb_setup_roots_iterator(xcb_get_setup(m_connection)).data->root)
        , m_window(xcb_generate_id(m_connection))
    {
        xcb_create_window(m_connection, 0, m_window, m_root, 0, 0, 1, 1, 0, XCB_WINDOW_CLASS_INPUT_ONLY,
                          XCB_COPY_FROM_PARENT, 0, nullptr);
        finish();
    }
    ~Manager()
    {
        xcb_delete_property(m_connection, m_root, atom(kBlur));
        finish();
        xcb_disconnect(m_connection);
    }
    Q_DISABLE_COPY(Manager)

    void composite()
    {
        xcb_set_selection_owner(m_connection, m_window, atom("_NET_WM_CM_S0"), XCB_CURRENT_TIME);
        finish();
    }
    void offerBlur()
    {
        xcb_change_property(m_connection, XCB_PROP_MODE_REPLACE, m_root, atom(kBlur), XCB_ATOM_CARDINAL, 32,
                            0, nullptr);
        finish();
    }
    bool wantsBlur(WId window)
    {
        const auto cookie =
            xcb_get_property(m_connection, 0, xcb_window_t(window), atom(kBlur), XCB_ATOM_CARDINAL, 0, 4);
        xcb_get_property_reply_t *reply = xcb_get_property_reply(m_connection, cookie, nullptr);
        const bool wants = reply && reply->value_len >= 4;
        std::free(reply);
        return wants;
    }

private:
    xcb_atom_t atom(const QByteArray &name)
    {
        const auto cookie = xcb_intern_atom(m_connection, 0, quint16(name.size()), name.constData());
        xcb_intern_atom_reply_t *reply = xcb_intern_atom_reply(m_connection, cookie, nullptr);
        const xcb_atom_t found = reply->atom;
        std::free(reply);
        return found;
    }
    // Waits until the server has done all that was asked.
    void finish() { atom("_NET_SUPPORTED"); }

    xcb_connection_t *m_connection;
    xcb_window_t m_root;
    xcb_window_t m_window;
};

} // namespace

class TestXDesktop : public QObject
{
    Q_OBJECT

private Q_SLOTS:
    void openGlIsLeftOut();
    void announcedAbilities_data();
    void announcedAbilities();
    void opaqueWindowAsksForNoBlur();
};

void TestXDesktop::openGlIsLeftOut()
{
    // Set for the platform plugin only; gone before the program could start a child that would inherit it.
    QCOMPARE(qgetenv(kGlIntegration), QByteArray("none"));
    QWidget window;
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    QTRY_VERIFY(!qEnvironmentVariableIsSet(kGlIntegration));
    QFile maps(QStringLiteral("/proc/self/maps"));
    QVERIFY(maps.open(QIODevice::ReadOnly));
    QVERIFY(!maps.readAll().contains("xcbglintegrations"));
}

void TestXDesktop::announcedAbilities_data()
{
    QTest::addColumn<bool>("composites");
    QTest::addColumn<bool>("blurs");
    QTest::newRow("none") << false << false;
    QTest::newRow("compositing") << true << false;
    QTest::newRow("blur") << true << true;
}

void TestXDesktop::announcedAbilities()
{
    QFETCH(bool, composites);
    QFETCH(bool, blurs);
    Manager manager;
    if (composites)
        manager.composite();
    if (blurs)
        manager.offerBlur();
    QCOMPARE(MWindowManagerHelper::instance()->hasComposite(), composites);
    QCOMPARE(MWindowManagerHelper::instance()->hasBlurWindow(), blurs);

    MBlurEffectWidget window;
    window.resize(380, 237);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    QCOMPARE(window.testAttribute(Qt::WA_TranslucentBackground), composites);
    QCOMPARE(manager.wantsBlur(window.winId()), blurs);
}

void TestXDesktop::opaqueWindowAsksForNoBlur()
{
    Manager manager;
    manager.composite();
    manager.offerBlur();
    MBlurEffectWidget window;
    window.setMaskAlpha(255);
    window.show();
    QVERIFY(QTest::qWaitForWindowExposed(&window));
    QVERIFY(!manager.wantsBlur(window.winId()));
}

int main(int argc, char **argv)
{
    const XServer server;
    if (server.display().isEmpty())
        qFatal("Xvfb did not start");
    qputenv("DISPLAY", server.display());
    qputenv("QT_QPA_PLATFORM", "xcb");
    MApplication application(argc, argv);
    TestXDesktop test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_xdesktop.moc"
