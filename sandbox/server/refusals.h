// SPDX-License-Identifier: Apache-2.0
#pragma once

#include <QString>

namespace sandbox {

// One way in which the server says no: HTTP status, "code" and "msg" of the reply. %1 in the words is
// replaced.
struct Refusal
{
    int status;
    int code;
    const char *words; // UTF-8
};

// All words of the server for its users, in one place.
namespace refusals {

// The code that terminals know: no room for another one.
constexpr Refusal kLimitReached = {200, -500000, "终端数量到达上限"};

constexpr Refusal kWrongCredentials = {200, 10001, "帐号或密码错误"};
constexpr Refusal kAccountLocked = {200, 10002, "帐号已被锁定，请联系管理员"};
constexpr Refusal kAccountUnknown = {200, 10003, "帐号不存在"};
constexpr Refusal kNotAdministrator = {200, 10004, "该帐号不是管理员，无权解除管控"};
constexpr Refusal kNotAuthorised = {200, 10005, "请先由管理员授权解除管控"};
constexpr Refusal kAliasTaken = {200, 10006, "终端别名已被使用"};
constexpr Refusal kAliasUnfit = {200, 10007, "终端别名应为1到32个字符"};
constexpr Refusal kMachineKnown = {400, 10008, "服务器已有此终端"};

constexpr Refusal kNoJson = {400, 40001, "请求内容不是有效的JSON对象"};
constexpr Refusal kFieldMissing = {400, 40002, "请求缺少字段：%1"};
constexpr Refusal kFieldWrong = {400, 40003, "字段的值无效：%1"};
constexpr Refusal kNotHttp = {400, 40004, "请求无法识别"};
constexpr Refusal kOnlyManaged = {403, 40301, "该接口只在终端的受管地址提供"};
constexpr Refusal kCertificateRevoked = {403, 40302, "终端证书已被吊销"};
constexpr Refusal kCertificateUnknown = {403, 40303, "终端证书不属于已加域的终端"};
constexpr Refusal kCertificateOfOther = {403, 40304, "终端证书与终端标识不一致"};
constexpr Refusal kPathUnknown = {404, 40400, "接口不存在"};
constexpr Refusal kMethodWrong = {405, 40500, "请求方法不允许"};
constexpr Refusal kTooLarge = {413, 41300, "请求内容过大"};
constexpr Refusal kInternalError = {500, 50000, "服务器内部错误"};

} // namespace refusals

// Thrown by the endpoints, turned into a reply by Dispatcher.
struct Refused
{
    Refusal refusal;
    QString detail = {}; // for %1
};

} // namespace sandbox
