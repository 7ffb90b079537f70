<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="zh_CN">
<context>
    <name>Text</name>
    <message>
        <source>%1, SHA-256 %2</source>
        <translation>%1，SHA-256 %2</translation>
    </message>
    <message>
        <source>is it HTTPS with TLS 1.2 or newer at this port?</source>
        <translation>该端口提供的是 HTTPS（TLS 1.2 或更新版本）吗？</translation>
    </message>
    <message>
        <source>every request is refused: %1</source>
        <translation>所有请求都不会发出：%1</translation>
    </message>
    <message>
        <source>not verified, SHA-256 of the server&apos;s certificate %1</source>
        <translation>未经验证，服务器证书的 SHA-256 为 %1</translation>
    </message>
    <message>
        <source>check the name and the resolver of this terminal</source>
        <translation>请检查名称和本终端的域名解析</translation>
    </message>
    <message>
        <source>%1 answers</source>
        <translation>%1 有应答</translation>
    </message>
    <message>
        <source>check port, route, firewall and proxy; is the server running?</source>
        <translation>请检查端口、路由、防火墙和代理；服务器在运行吗？</translation>
    </message>
    <message>
        <source>the server does not tell its time</source>
        <translation>服务器没有给出时间</translation>
    </message>
    <message>
        <source>the clock here is %1 seconds ahead of the server&apos;s</source>
        <translation>本机时钟比服务器快 %1 秒</translation>
    </message>
    <message>
        <source>set the clock: certificates fail where it is wrong</source>
        <translation>请校准时钟：时钟不准时证书验证会失败</translation>
    </message>
    <message>
        <source>is it a management server, and nothing in between?</source>
        <translation>对方是管理服务器吗？中间没有别的设备吗？</translation>
    </message>
    <message>
        <source>status %1, and the reply is not JSON</source>
        <translation>状态码 %1，应答不是 JSON</translation>
    </message>
    <message>
        <source>status %1, the server says: %2</source>
        <translation>状态码 %1，服务器回复：%2</translation>
    </message>
    <message>
        <source>the CA is longer than %1 bytes</source>
        <translation>CA 超过 %1 字节</translation>
    </message>
    <message>
        <source>the reply holds no CA certificate</source>
        <translation>应答中没有 CA 证书</translation>
    </message>
    <message>
        <source>not under the CA that the server hands out: %1</source>
        <translation>服务器未通过它自己所发 CA 的验证：%1</translation>
    </message>
    <message>
        <source>look at the server&apos;s own log</source>
        <translation>请查看服务器自身的日志</translation>
    </message>
    <message>
        <source>this terminal may join</source>
        <translation>本终端可以加入</translation>
    </message>
    <message>
        <source>the server has no place for another terminal</source>
        <translation>服务器的终端数量已满</translation>
    </message>
    <message>
        <source>remove terminals on the server, or extend the licence</source>
        <translation>请在服务器上移除终端，或扩充授权</translation>
    </message>
    <message>
        <source>the server has this machine already: %1</source>
        <translation>服务器上已有此机器：%1</translation>
    </message>
    <message>
        <source>remove it there; or do two machines have the same identity?</source>
        <translation>请在服务器上移除；或者有两台机器的标识相同？</translation>
    </message>
    <message>
        <source>systemctl cannot be run</source>
        <translation>无法运行 systemctl</translation>
    </message>
    <message>
        <source>is not installed</source>
        <translation>未安装</translation>
    </message>
    <message>
        <source>install its package</source>
        <translation>请安装其软件包</translation>
    </message>
    <message>
        <source>is enabled for all users</source>
        <translation>已对所有用户启用</translation>
    </message>
    <message>
        <source>is not enabled: %1</source>
        <translation>未启用：%1</translation>
    </message>
    <message>
        <source>id cannot be run</source>
        <translation>无法运行 id</translation>
    </message>
    <message>
        <source>this user may take the terminal out of the domain</source>
        <translation>该用户可以解除管控</translation>
    </message>
    <message>
        <source>this user may not take the terminal out of the domain</source>
        <translation>该用户不能解除管控</translation>
    </message>
    <message>
        <source>who may is in the groups sudo and vesk</source>
        <translation>可以解除的用户须在 sudo 和 vesk 两个组中</translation>
    </message>
    <message>
        <source>is not a regular file</source>
        <translation>不是普通文件</translation>
    </message>
    <message>
        <source>belongs to another user</source>
        <translation>属于其他用户</translation>
    </message>
    <message>
        <source>can be written by others</source>
        <translation>其他用户可写</translation>
    </message>
    <message>
        <source>is too long</source>
        <translation>过长</translation>
    </message>
    <message>
        <source>is empty</source>
        <translation>为空</translation>
    </message>
    <message>
        <source>is a symbolic link</source>
        <translation>是符号链接</translation>
    </message>
    <message>
        <source>%1 is not there</source>
        <translation>%1 不存在</translation>
    </message>
    <message>
        <source>restore the file, or remove the terminal on the server and join again</source>
        <translation>请恢复该文件，或在服务器上移除本终端后重新加入</translation>
    </message>
    <message>
        <source>%1 holds no certificate, or a damaged one</source>
        <translation>%1 中没有证书，或证书已损坏</translation>
    </message>
    <message>
        <source>restore the file</source>
        <translation>请恢复该文件</translation>
    </message>
    <message>
        <source>%1 is not valid yet: it begins on %2</source>
        <translation>%1 尚未生效：自 %2 起有效</translation>
    </message>
    <message>
        <source>check the clock; have the certificate renewed</source>
        <translation>请检查时钟；请更新证书</translation>
    </message>
    <message>
        <source>: others can read this key</source>
        <translation>：其他用户可读此私钥</translation>
    </message>
    <message>
        <source>owner root, a group of those who may leave, mode 0640</source>
        <translation>属主应为 root，组为可以解除管控的用户，模式 0640</translation>
    </message>
    <message>
        <source>run this program as %1, whose file it is</source>
        <translation>请以文件属主 %1 的身份运行本程序</translation>
    </message>
    <message>
        <source>this user may not read %1</source>
        <translation>该用户无权读取 %1</translation>
    </message>
    <message>
        <source>run this program as root, or as a user who may leave the domain</source>
        <translation>请以 root 或可以解除管控的用户身份运行本程序</translation>
    </message>
    <message>
        <source>: left over, this terminal has not joined</source>
        <translation>：遗留文件，本终端并未加入</translation>
    </message>
    <message>
        <source>remove it, or restore the record</source>
        <translation>请删除它，或恢复记录</translation>
    </message>
    <message>
        <source>no CA here: the first server that is asked is trusted</source>
        <translation>本机没有 CA：首个被访问的服务器将被信任</translation>
    </message>
    <message>
        <source>restore CA, certificate and key</source>
        <translation>请恢复 CA、证书和私钥</translation>
    </message>
    <message>
        <source>no certificate with a key</source>
        <translation>没有成对的证书和私钥</translation>
    </message>
    <message>
        <source>cannot tell whether the key belongs to the certificate</source>
        <translation>无法判断私钥与证书是否匹配</translation>
    </message>
    <message>
        <source>damaged, or the key does not belong to the certificate</source>
        <translation>已损坏，或私钥与证书不匹配</translation>
    </message>
    <message>
        <source>restore the pair: both files of the same join</source>
        <translation>请恢复同一次加入所得的证书和私钥</translation>
    </message>
    <message>
        <source>the key belongs to the certificate</source>
        <translation>私钥与证书匹配</translation>
    </message>
    <message>
        <source>install vesk-mde-schemas, or what the desktop provides in its place</source>
        <translation>请安装 vesk-mde-schemas，或桌面提供的替代软件包</translation>
    </message>
    <message>
        <source>is installed, with all keys</source>
        <translation>已安装，所有键齐全</translation>
    </message>
    <message>
        <source>lacks the keys %1</source>
        <translation>缺少键 %1</translation>
    </message>
    <message>
        <source>this user sees the switch</source>
        <translation>该用户能看到此开关</translation>
    </message>
    <message>
        <source>this user does not see the switch</source>
        <translation>该用户看不到此开关</translation>
    </message>
    <message>
        <source>is not installed: a leave does not restore the desktop</source>
        <translation>未安装：解除管控时不能恢复桌面</translation>
    </message>
    <message>
        <source>%1 is not HOST:PORT</source>
        <translation>%1 不是“主机:端口”的形式</translation>
    </message>
    <message>
        <source>%1 is not a number of days</source>
        <translation>%1 不是天数</translation>
    </message>
    <message>
        <source>One JSON object instead of text.</source>
        <translation>以一个 JSON 对象代替文字。</translation>
    </message>
    <message>
        <source>Ask a server whether this terminal would join there.</source>
        <translation>询问服务器本终端能否加入。</translation>
    </message>
    <message>
        <source>Write a report without keys and passwords into a new file.</source>
        <translation>将不含密钥和密码的报告写入新文件。</translation>
    </message>
    <message>
        <source>Tells what this terminal is, and what is wrong with it.</source>
        <translation>说明本终端的状态和存在的问题。</translation>
    </message>
    <message>
        <source>the D-Bus library cannot start its thread</source>
        <translation>D-Bus 库无法启动其线程</translation>
    </message>
    <message>
        <source>these arguments do not go together, see --help</source>
        <translation>这些参数不能同时使用，见 --help</translation>
    </message>
    <message>
        <source>this user has no session bus here</source>
        <translation>该用户在此没有会话总线</translation>
    </message>
    <message>
        <source>the system bus cannot be reached</source>
        <translation>无法连接系统总线</translation>
    </message>
    <message>
        <source>is there</source>
        <translation>存在</translation>
    </message>
    <message>
        <source>is started when it is called</source>
        <translation>调用时启动</translation>
    </message>
    <message>
        <source>is not on the bus</source>
        <translation>不在总线上</translation>
    </message>
    <message>
        <source>install its package, or check its status with systemctl</source>
        <translation>请安装其软件包，或用 systemctl 查看其状态</translation>
    </message>
    <message>
        <source>%1 is not there: a join makes it</source>
        <translation>%1 不存在：加入时会创建</translation>
    </message>
    <message>
        <source>%1 is not a sticky directory of root&apos;s</source>
        <translation>%1 不是属于 root 且带粘滞位的目录</translation>
    </message>
    <message>
        <source>systemd-tmpfiles --remove --create veskw.conf, which removes what is in it</source>
        <translation>systemd-tmpfiles --remove --create veskw.conf（会删除其中的内容）</translation>
    </message>
    <message>
        <source>nothing is staged</source>
        <translation>没有暂存的文件</translation>
    </message>
    <message>
        <source>from a join that waits for its reboot, or was given up; the reboot removes it</source>
        <translation>来自等待重启或已放弃的加入；重启时删除</translation>
    </message>
    <message>
        <source>cannot tell whether this terminal has joined</source>
        <translation>无法判断本终端是否已加入</translation>
    </message>
    <message>
        <source>this terminal has joined</source>
        <translation>本终端已加入</translation>
    </message>
    <message>
        <source>this terminal has not joined</source>
        <translation>本终端尚未加入</translation>
    </message>
    <message>
        <source>%1 does not say whether this terminal has joined</source>
        <translation>%1 没有说明本终端是否已加入</translation>
    </message>
    <message>
        <source>%1 names no server of a terminal that has joined</source>
        <translation>%1 没有给出已加入终端的服务器</translation>
    </message>
    <message>
        <source>%1 is not a regular file, or is too long</source>
        <translation>%1 不是普通文件，或过长</translation>
    </message>
    <message>
        <source>%1 is empty</source>
        <translation>%1 为空</translation>
    </message>
    <message>
        <source>%1 is torn: not a JSON object</source>
        <translation>%1 已残缺：不是 JSON 对象</translation>
    </message>
    <message>
        <source>let all users read it: mode 0644</source>
        <translation>请让所有用户可读：模式 0644</translation>
    </message>
    <message>
        <source>have the identity of this machine written there, in one line</source>
        <translation>请将本机标识写入该文件，占一行</translation>
    </message>
    <message>
        <source>%1 is not there or cannot be used</source>
        <translation>%1 不存在或不可用</translation>
    </message>
    <message>
        <source>%1 does not hold one identity in one line</source>
        <translation>%1 中不是占一行的单个标识</translation>
    </message>
    <message>
        <source>the certificate is of another CA, has expired, or is for another name; the clock here says %1</source>
        <translation>证书由其他 CA 签发、已过期或属于其他名称；本机时钟为 %1</translation>
    </message>
    <message>
        <source>: %1, issued by %2, SHA-256 %3, expires in %4 days</source>
        <translation>：%1，签发者 %2，SHA-256 %3，%4 天后到期</translation>
    </message>
    <message>
        <source>%1 has expired: on %2</source>
        <translation>%1 已于 %2 过期</translation>
    </message>
    <message>
        <source>have the certificate renewed before it expires</source>
        <translation>请在到期前更新证书</translation>
    </message>
    <message>
        <source>%1 expires on %2, in %3 days: %4</source>
        <translation>%1 将于 %2 到期，还有 %3 天：%4</translation>
    </message>
    <message>
        <source>cannot tell when %1 expires</source>
        <translation>无法判断 %1 何时到期</translation>
    </message>
    <message>
        <source>Only tell which certificates expire within so many days.</source>
        <translation>只列出在指定天数内到期的证书。</translation>
    </message>
    <message>
        <source>restore the record; or remove it here and the terminal on the server, and join again</source>
        <translation>请恢复记录；或在本机删除记录、在服务器上移除终端，然后重新加入</translation>
    </message>
    <message>
        <source>the server&apos;s certificate passes under %1</source>
        <translation>服务器证书以 %1 通过验证</translation>
    </message>
    <message>
        <source>have it installed again: a regular file of root&apos;s, mode 0644, the key 0640</source>
        <translation>请重新安装：属主为 root 的普通文件，模式 0644，私钥 0640</translation>
    </message>
    <message>
        <source>cannot tell what becomes of a request</source>
        <translation>无法判断请求会怎样</translation>
    </message>
    <message>
        <source>/etc/vesk holds CA, certificate and key, or before a join at most a CA: regular files of root&apos;s, mode 0644, the key 0640</source>
        <translation>/etc/vesk 中应有 CA、证书和私钥，加入之前最多有一个 CA：属主为 root 的普通文件，模式 0644，私钥 0640</translation>
    </message>
    <message>
        <source>requests are made without client certificate</source>
        <translation>请求不使用客户端证书</translation>
    </message>
    <message>
        <source>to have the first call verified, install the server&apos;s CA as %1</source>
        <translation>如需验证首次请求，请将服务器的 CA 安装为 %1</translation>
    </message>
    <message>
        <source>requests are verified, and made with the client certificate</source>
        <translation>请求经过验证，并使用客户端证书</translation>
    </message>
    <message>
        <source>requests are verified under the CA</source>
        <translation>请求以该 CA 验证</translation>
    </message>
    <message>
        <source>not known</source>
        <translation>未知</translation>
    </message>
    <message>
        <source>libcurl cannot be set up</source>
        <translation>无法使用 libcurl</translation>
    </message>
    <message>
        <source>is not installed: the enrolment program is aborted in a join or a leave</source>
        <translation>未安装：加域程序会在加入或解除时异常终止</translation>
    </message>
    <message>
        <source>is not on the bus of this session</source>
        <translation>不在本会话的总线上</translation>
    </message>
</context>
</TS>
