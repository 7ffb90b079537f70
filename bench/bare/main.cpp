// SPDX-License-Identifier: Apache-2.0
// What a measured window is compared with: the same texts and fields in one fixed window of Qt's own
// widgets.
//
//   bare [--lean] server|panel
//
// Without --lean everything is as Qt has it by default. With it OpenGL is left out and one application font
// is set.
#include <QApplication>
#include <QFont>
#include <QGridLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

#include <cstring>

namespace {

QPushButton *button(const char *text, const QSize &size)
{
    auto *made = new QPushButton(QString::fromUtf8(text));
    made->setFixedSize(size);
    return made;
}

QVBoxLayout *titled(QWidget *window, const char *title)
{
    auto *layout = new QVBoxLayout(window);
    layout->addWidget(new QLabel(QString::fromUtf8(title)), 0, Qt::AlignCenter);
    return layout;
}

void fillServerPage(QWidget *window)
{
    auto *fields = new QGridLayout;
    fields->addWidget(new QLabel(QString::fromUtf8("域地址:")), 0, 0);
    fields->addWidget(new QLineEdit, 0, 1);
    fields->addWidget(new QLabel(QString::fromUtf8("端     口:")), 1, 0);
    fields->addWidget(new QLineEdit, 1, 1);

    auto *buttons = new QHBoxLayout;
    buttons->addWidget(button("取消", {170, 36}));
    buttons->addWidget(button("下一步", {170, 36}));

    QVBoxLayout *layout = titled(window, "服务器配置");
    layout->addLayout(fields);
    layout->addLayout(buttons);
    window->setFixedSize(380, 237);
}

void fillPanel(QWidget *window)
{
    auto *buttons = new QHBoxLayout;
    buttons->addWidget(button("取消", {170, 36}));
    buttons->addWidget(button("解除", {170, 36}));

    titled(window, "该终端已经加入管控,是否解除管控?")->addLayout(buttons);
    window->setFixedSize(380, 140);
}

} // namespace

int main(int argc, char **argv)
{
    const bool lean = argc > 1 && std::strcmp(argv[1], "--lean") == 0;
    const char *page = argc > 1 ? argv[argc - 1] : "";
    if (lean)
        qputenv("QT_XCB_GL_INTEGRATION", "none");

    QApplication application(argc, argv);
    if (lean) {
        QFont font(QStringLiteral("Noto Sans CJK SC"));
        font.setPixelSize(14);
        QApplication::setFont(font);
    }

    QWidget window;
    if (std::strcmp(page, "server") == 0)
        fillServerPage(&window);
    else if (std::strcmp(page, "panel") == 0)
        fillPanel(&window);
    else
        qFatal("usage: bare [--lean] server|panel");
    window.show();
    return QApplication::exec();
}
