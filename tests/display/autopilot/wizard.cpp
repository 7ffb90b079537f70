// SPDX-License-Identifier: Apache-2.0
// A wizard in miniature for the tests of the autopilot: pages with titles, captions and buttons like those of
// the program, driven by its arguments alone. Says on standard output what was pressed and what stood in the
// fields at that moment.
//
//     wizard [--from PAGE] [--box PAGE=TEXT]... [--then PAGE=TEXT]... [--dead PAGE] [--quit PAGE] [--mute
//     PAGE]
//            [--busy MILLISECONDS] [--call MILLISECONDS]
//
//     --from  the first page
//     --box   a press on PAGE opens this message box and leads nowhere; each box comes once, one for each
//     press
//     --then  a second message box that follows the one of --box
//     --dead  the button of PAGE stays disabled
//     --quit  a press on PAGE ends the process
//     --mute  a press on PAGE does nothing
//     --busy  each press holds the event loop for so long before anything happens
//     --call  each press makes a call of so long before anything happens, and another before a second box:
//     the event loop runs, and no button can be pressed

#include <QApplication>
#include <QCommandLineParser>
#include <QDialog>
#include <QEventLoop>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTextStream>
#include <QThread>
#include <QTimer>
#include <QVBoxLayout>

#include <vector>

namespace {

struct PageText
{
    QString name;
    QString title;
    QStringList captions; // the second field of the account page is a password
    QString button;
};

const std::vector<PageText> kPages = {
    {QStringLiteral("server"),
     QStringLiteral("服务器配置"),
     {QStringLiteral("域地址:"), QStringLiteral("端     口:")},
     QStringLiteral("下一步")},
    {QStringLiteral("account"),
     QStringLiteral("请校验域帐号密码"),
     {QStringLiteral("域帐号:"), QStringLiteral("   密     码:")},
     QStringLiteral("下一步")},
    {QStringLiteral("alias"),
     QStringLiteral("新建终端别名"),
     {QStringLiteral("终端别名:")},
     QStringLiteral("下一步")},
    {QStringLiteral("summary"), QStringLiteral("完成配置"), {}, QStringLiteral("完成")},
    {QStringLiteral("success"),
     QStringLiteral("终端已成功加入域管,重启电脑生效"),
     {},
     QStringLiteral("立即重启")},
    {QStringLiteral("leave"), QStringLiteral("该终端已经加入管控,是否解除管控?"), {}, QStringLiteral("解除")},
    {QStringLiteral("removed"),
     QStringLiteral("当前终端已解除管控，重启后生效"),
     {},
     QStringLiteral("立即重启")},
};

class Wizard : public QWidget
{
public:
    explicit Wizard(const QCommandLineParser &arguments);

private:
    void addPage(const PageText &text);
    void onPressed(const PageText &text, const QList<QLineEdit *> &edits);
    void call();
    bool showBoxOf(const QString &page);
    void turnFrom(const QString &page);

    const QCommandLineParser &m_arguments;
    QStringList m_boxes; // PAGE=TEXT, those to come
    QVBoxLayout *m_layout;
    std::vector<QWidget *> m_pages;
};

// As in the program, the caption is the name of the edit itself or that of a widget around it.
QLineEdit *addField(QLayout *layout, const QString &caption)
{
    auto *row = new QWidget;
    auto *edit = new QLineEdit;
    (new QVBoxLayout(row))->addWidget(edit);
    layout->addWidget(new QLabel(caption));
    layout->addWidget(row);
    if (caption.contains(QStringLiteral("密"))) {
        row->setAccessibleName(caption);
        edit->setEchoMode(QLineEdit::Password);
    } else {
        edit->setAccessibleName(caption);
        edit->setText(QStringLiteral("kept"));
    }
    return edit;
}

QList<QLineEdit *> addFields(QLayout *layout, const QStringList &captions)
{
    QList<QLineEdit *> edits;
    for (const QString &caption : captions)
        edits.append(addField(layout, caption));
    return edits;
}

void tell(QStringList words, const QList<QLineEdit *> &edits)
{
    for (const QLineEdit *edit : edits)
        words.append(edit->text());
    QTextStream(stdout) << words.join(QLatin1Char(' ')) << Qt::endl;
}

void showDialog(QWidget *parent, const QString &title, const QStringList &captions, const QString &button)
{
    QDialog dialog(parent);
    auto *layout = new QVBoxLayout(&dialog);
    layout->addWidget(new QLabel(title));
    const QList<QLineEdit *> edits = addFields(layout, captions);
    auto *accept = new QPushButton(button);
    layout->addWidget(accept);
    QObject::connect(accept, &QPushButton::clicked, &dialog, &QDialog::accept);
    dialog.exec();
    tell({button}, edits);
}

Wizard::Wizard(const QCommandLineParser &arguments)
    : m_arguments(arguments)
    , m_boxes(arguments.values(QStringLiteral("box")))
    , m_layout(new QVBoxLayout(this))
{
    for (const PageText &text : kPages)
        addPage(text);
    setFixedWidth(380);
}

void Wizard::addPage(const PageText &text)
{
    auto *page = new QWidget;
    auto *layout = new QVBoxLayout(page);
    layout->addWidget(new QLabel(text.title));
    const QList<QLineEdit *> edits = addFields(layout, text.captions);
    auto *button = new QPushButton(text.button);
    button->setEnabled(m_arguments.value(QStringLiteral("dead")) != text.name);
    layout->addWidget(button);
    connect(button, &QPushButton::clicked, this, [this, text, edits] { onPressed(text, edits); });
    m_layout->addWidget(page);
    page->setVisible(text.name == m_arguments.value(QStringLiteral("from")));
    m_pages.push_back(page);
}

void Wizard::onPressed(const PageText &text, const QList<QLineEdit *> &edits)
{
    tell({text.name}, edits);
    QThread::msleep(m_arguments.value(QStringLiteral("busy")).toULong());
    call();
    if (m_arguments.value(QStringLiteral("quit")) == text.name)
        QCoreApplication::quit();
    else if (m_arguments.value(QStringLiteral("mute")) != text.name && !showBoxOf(text.name))
        turnFrom(text.name);
}

void Wizard::call()
{
    const int length = m_arguments.value(QStringLiteral("call")).toInt();
    if (length == 0)
        return;
    setEnabled(false);
    QEventLoop loop;
    QTimer::singleShot(length, &loop, &QEventLoop::quit);
    loop.exec();
    setEnabled(true);
}

bool Wizard::showBoxOf(const QString &page)
{
    const QString start = page + QLatin1Char('=');
    const QString box = m_boxes.filter(start).value(0);
    if (box.isEmpty())
        return false;
    m_boxes.removeOne(box);
    const QStringList texts = m_arguments.values(QStringLiteral("then")).filter(start);
    showDialog(this, box.mid(start.size()), {}, QStringLiteral("确定"));
    for (const QString &text : texts) {
        call();
        showDialog(this, text.mid(start.size()), {}, QStringLiteral("确定"));
    }
    return true;
}

void Wizard::turnFrom(const QString &page)
{
    if (page == QLatin1String("leave")) {
        showDialog(this, QStringLiteral("退出域管系统需要管理员权限"),
                   {QStringLiteral("管理员帐号"), QStringLiteral("密码")}, QStringLiteral("授权"));
    }
    if (page == QLatin1String("success"))
        return; // the machine is about to go down
    for (size_t i = 0; i + 1 < kPages.size(); ++i) {
        if (kPages[i].name == page) {
            m_pages[i]->hide();
            m_pages[i + 1]->show();
        }
    }
}

} // namespace

int main(int argc, char **argv)
{
    QApplication application(argc, argv);
    QCommandLineParser arguments;
    for (const char *name : {"box", "then", "dead", "quit", "mute"})
        arguments.addOption({QString::fromLatin1(name), {}, QStringLiteral("value")});
    arguments.addOption({QStringLiteral("from"), {}, QStringLiteral("page"), QStringLiteral("server")});
    for (const char *name : {"busy", "call"})
        arguments.addOption(
            {QString::fromLatin1(name), {}, QStringLiteral("milliseconds"), QStringLiteral("0")});
    arguments.process(application);

    Wizard wizard(arguments);
    wizard.show();
    return QApplication::exec();
}
