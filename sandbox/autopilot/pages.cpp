// SPDX-License-Identifier: Apache-2.0
#include "pages.h"

#include <algorithm>

namespace sandbox {

namespace {

using Input = ScenarioInput;

const std::vector<Page> &allPages()
{
    static const std::vector<Page> pages = {
        {QStringLiteral("server"),
         1,
         QStringLiteral("服务器配置"),
         QStringLiteral("下一步"),
         {{QStringLiteral("域地址"), &Input::host}, {QStringLiteral("端口"), &Input::port}},
         Journey::Join},
        {QStringLiteral("account"),
         2,
         QStringLiteral("请校验域帐号密码"),
         QStringLiteral("下一步"),
         {{QStringLiteral("域帐号"), &Input::user}, {QStringLiteral("密码"), &Input::password}},
         Journey::Join},
        {QStringLiteral("alias"),
         3,
         QStringLiteral("新建终端别名"),
         QStringLiteral("下一步"),
         {{QStringLiteral("终端别名"), &Input::alias}},
         Journey::Join},
        {QStringLiteral("summary"), 4, QStringLiteral("完成配置"), QStringLiteral("完成"), {}, Journey::Join},
        {QStringLiteral("progress"),
         5,
         QStringLiteral("配置中，请稍后"),
         {},
         {},
         Journey::Join,
         false,
         {},
         true},
        {QStringLiteral("success"),
         6,
         QStringLiteral("终端已成功加入域管,重启电脑生效"),
         QStringLiteral("立即重启"),
         {},
         Journey::Join,
         true},

        {QStringLiteral("leave"),
         1,
         QStringLiteral("该终端已经加入管控,是否解除管控?"),
         QStringLiteral("解除"),
         {},
         Journey::Leave},
        {QStringLiteral("authorise"),
         2,
         QStringLiteral("退出域管系统需要管理员权限"),
         QStringLiteral("授权"),
         {{QStringLiteral("管理员帐号"), &Input::administrator},
          {QStringLiteral("密码"), &Input::administratorPassword}},
         Journey::Leave,
         false,
         QStringLiteral("取消")},
        {QStringLiteral("progress"), 3, QStringLiteral("解除中,请稍等..."), {}, {}, Journey::Leave},
        {QStringLiteral("success"),
         4,
         QStringLiteral("当前终端已解除管控，重启后生效"),
         QStringLiteral("立即重启"),
         {},
         Journey::Leave,
         true},
    };
    return pages;
}

const Page *pageOf(const Element &window)
{
    const QStringList texts = window.labels() << window.name;
    const std::vector<Page> &pages = allPages();
    const auto found = std::find_if(pages.begin(), pages.end(),
                                    [&texts](const Page &page) { return texts.contains(page.title); });
    return found == pages.end() ? nullptr : &*found;
}

} // namespace

std::optional<Window> Window::inFront(const std::vector<Element> &windows)
{
    const auto box = std::find_if(windows.rbegin(), windows.rend(),
                                  [](const Element &each) { return each.role == Element::Role::Dialog; });
    if (box != windows.rend())
        return Window(*box, pageOf(*box));
    for (const Element &each : windows) {
        if (const Page *page = pageOf(each))
            return Window(each, page);
    }
    return std::nullopt;
}

bool Window::isAtRest() const
{
    if (m_page != nullptr && m_page->isNeverAtRest)
        return false;
    const std::vector<const Element *> buttons = m_element.buttons();
    const auto isEnabled = [](const Element *each) {
        return each->enabled;
    };
    const auto isPressed = [](const Element *each) {
        return each->pressed;
    };
    return std::any_of(buttons.begin(), buttons.end(), isEnabled) &&
           std::none_of(buttons.begin(), buttons.end(), isPressed);
}

QString Window::message() const
{
    return m_element.labels().join(QLatin1Char('\n'));
}

} // namespace sandbox
