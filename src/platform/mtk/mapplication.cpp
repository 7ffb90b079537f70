// SPDX-License-Identifier: Apache-2.0
#include "mapplication.h"

#include "style/theme.h"
#include "style/themestyle.h"
#include "system/fontfamilies.h"
#include "system/inputgate.h"
#include "system/instanceclaim.h"
#include "system/platformstart.h"
#include "system/secrettexts.h"
#include "system/xdesktop.h"

#include <QEvent>
#include <QFileInfo>
#include <QFont>
#include <QWindow>

#include <unistd.h>

namespace Mtk::Widget {

namespace {

constexpr char kGlIntegration[] = "QT_XCB_GL_INTEGRATION";
bool glRequestIsOurs = false;

// Sets what Qt reads while the application object is constructed; called before the base class's constructor.
int &prepared(int &argc)
{
    glRequestIsOurs = !qEnvironmentVariableIsSet(kGlIntegration) && qputenv(kGlIntegration, "none");
    QCoreApplication::setAttribute(Qt::AA_EnableHighDpiScaling);
    QCoreApplication::setAttribute(Qt::AA_UseHighDpiPixmaps);
    // Else plugins of the desktop set fonts and colors of their own, whenever their settings change.
    QGuiApplication::setDesktopSettingsAware(false);
    if (XDesktop::isDensitySet())
        QGuiApplication::setHighDpiScaleFactorRoundingPolicy(
            Qt::HighDpiScaleFactorRoundingPolicy::PassThrough);
    QApplication::setStyle(new ThemeStyle);
    FontFamilies::complete();
    PlatformStart::begin();
    return argc;
}

QFont applicationFont()
{
    QFont font(QStringLiteral("Source Han Sans CN"));
    font.setPixelSize(theme().fontPixelSize);
    return font;
}

} // namespace

MApplication::MApplication(int &argc, char **argv)
    : QApplication(prepared(argc), argv)
{
    PlatformStart::finish();
    // The user's environment or command line may have named another.
    if (!qobject_cast<ThemeStyle *>(style()))
        setStyle(new ThemeStyle);
    setPalette(themePalette());
    setFont(applicationFont());
    setDesktopFileName(QFileInfo(applicationFilePath()).fileName());
    XDesktop::separateRepeats();
    m_gate = std::make_unique<InputGate>(this);
    SecretTexts::installFilter();
    connect(this, &MApplication::firstPainted, this, &MApplication::dropGlRequest);
    installEventFilter(this);
}

MApplication::~MApplication()
{
    SecretTexts::removeFilter();
    for (const int descriptor : qAsConst(m_claims))
        close(descriptor);
}

bool MApplication::setSingleInstance(const QString &key)
{
    if (m_claims.contains(key))
        return true;
    const InstanceClaim::Claim claim = InstanceClaim::take(key);
    if (claim.answer == InstanceClaim::Answer::Granted)
        m_claims.insert(key, claim.descriptor);
    if (claim.answer == InstanceClaim::Answer::Unavailable)
        qWarning("A second start cannot be told from the first: no directory for its lock is the user's own");
    return claim.answer != InstanceClaim::Answer::Taken;
}

bool MApplication::isBusy() const
{
    return m_busyDepth > 0;
}

void MApplication::setBusy(bool busy)
{
    const bool wasBusy = isBusy();
    m_busyDepth = qMax(0, m_busyDepth + (busy ? 1 : -1));
    if (isBusy() == wasBusy)
        return;
    if (busy)
        setOverrideCursor(Qt::BusyCursor);
    m_gate->setBusy(busy);
    if (!busy)
        restoreOverrideCursor();
}

bool MApplication::eventFilter(QObject *watched, QEvent *event)
{
    if (event->type() == QEvent::Expose && qobject_cast<QWindow *>(watched)) {
        removeEventFilter(this);
        // Queued, since the platform plugin reads the request when the window is first painted.
        QMetaObject::invokeMethod(this, &MApplication::firstPainted, Qt::QueuedConnection);
    }
    return QApplication::eventFilter(watched, event);
}

bool MApplication::notify(QObject *receiver, QEvent *event)
{
    return (m_gate && m_gate->isRepeatedPress(*receiver, *event)) || QApplication::notify(receiver, event);
}

void MApplication::dropGlRequest()
{
    if (glRequestIsOurs)
        qunsetenv(kGlIntegration);
}

} // namespace Mtk::Widget
