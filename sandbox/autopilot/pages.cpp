// SPDX-License-Identifier: Apache-2.0
#include "pages.h"

#include <algorithm>

namespace sandbox {

namespace {

using Input = ScenarioInput;

Page page(Journey journey, int number, const char *name, const char *title, const char *button,
          const std::vector<Field> &fields = {}, const QString &cancelButton = {})
{
    const auto text = [](const char *utf8) {
        return QString::fromUtf8(utf8);
    };
    return {journey, text(name), number, text(title), text(button), fields, cancelButton};
}

const Page *pageOf(const Element &window)
{
    const QString heard = window.role == Element::Window ? window.description : window.name;
    const std::vector<Page> &pages = allPages();
    const auto found = std::find_if(pages.begin(), pages.end(), [&](const Page &page) {
        return page.title == heard && window.labels().contains(heard);
    });
    return found == pages.end() ? nullptr : &*found;
}

} // namespace

const std::vector<Page> &allPages()
{
    constexpr Journey join = Journey::Join;
    constexpr Journey leave = Journey::Leave;
    static const std::vector<Page> pages = {
        page(join, 1, "server", "服务器配置", "下一步",
             {{QStringLiteral("域地址"), &Input::host}, {QStringLiteral("端口"), &Input::port}}),
        page(join, 2, "account", "请校验域帐号密码", "下一步",
             {{QStringLiteral("域帐号"), &Input::user}, {QStringLiteral("密码"), &Input::password}}),
        page(join, 3, "alias", "新建终端别名", "下一步", {{QStringLiteral("终端别名"), &Input::alias}}),
        page(join, 4, "summary", "完成配置", "完成"),
        page(join, 5, "progress", "配置中，请稍后", ""),
        page(join, 6, "success", "终端已成功加入域管,重启电脑生效", "立即重启"),

        page(leave, 1, "leave", "该终端已经加入管控,是否解除管控?", "解除"),
        page(leave, 2, "authorise", "退出域管系统需要管理员权限", "授权",
             {{QStringLiteral("管理员帐号"), &Input::administrator},
              {QStringLiteral("密码"), &Input::administratorPassword}},
             QStringLiteral("取消")),
        page(leave, 3, "progress", "解除中,请稍等...", ""),
        page(leave, 4, "success", "当前终端已解除管控，重启后生效", "立即重启"),
    };
    return pages;
}

std::optional<Window> Window::inFront(const std::vector<Element> &windows)
{
    const auto dialog = std::find_if(windows.rbegin(), windows.rend(),
                                     [](const Element &each) { return each.role == Element::Dialog; });
    if (dialog != windows.rend())
        return Window{*dialog, pageOf(*dialog)};
    for (const Element &each : windows) {
        if (const Page *page = pageOf(each))
            return Window{each, page};
    }
    return std::nullopt;
}

bool Window::isAtRest() const
{
    const std::vector<const Element *> buttons = element.all(Element::Button);
    const auto is = [&buttons](bool Element::*state) {
        return std::any_of(buttons.begin(), buttons.end(),
                           [state](const Element *each) { return each->*state; });
    };
    return !(page != nullptr && page->isNeverAtRest()) && is(&Element::enabled) && !is(&Element::pressed);
}

} // namespace sandbox
