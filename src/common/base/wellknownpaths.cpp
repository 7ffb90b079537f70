// SPDX-License-Identifier: Apache-2.0
#include "wellknownpaths.h"

namespace vesk {

const char kUserinfoPath[] = "/etc/vesk/userinfo.json";
const char kMachineidPath[] = "/usr/share/vesk/machine.txt";
const char kServerCertPath[] = "/etc/vesk/clientapi_ca.crt";
const char kPublicKeyPath[] = "/etc/vesk/MOS_Vesk.pem";
const char kPrivateKeyPath[] = "/etc/vesk/.MOS_Vesk.key";
const char kTmpCaCertPath[] = "/tmp/vesk/clientapi_ca.crt";
const char kTmpPrivateKeyPath[] = "/tmp/vesk/client.key";
const char kTmpPublicKeyPath[] = "/tmp/vesk/client.crt";
const char kBackupConfigPath[] = "/etc/vesk/config.ini";
const char KPCRegular[] = "https://%1:%2/uim/v3/client/config?key=pc_name_rules";

const char kTmpUserinfoPath[] = "/tmp/vesk/userinfo.json";
const char kVeskConfigPath[] = "/etc/vesk/";
const char kCaCertPath[] = "/etc/vesk/clientapi_ca.crt";
const char kPicPath[] = "/etc/vesk/pic";
const char kBackupSSHConfigPath[] = "/etc/vesk/sshd_config_bc";
const char kSSHConfigPath[] = "/etc/ssh/sshd_config";
const char kBackupSourcesListPath[] = "/etc/vesk/sources.list_bc";
const char kBackupAppstoreListPath[] = "/etc/vesk/appstore.list_bc";
const char kAppstoreListPath[] = "/etc/apt/sources.list.d/appstore.list";
const char kAppstoreSourcesListPath[] = "/etc/apt/sources.list.d/appstore.list";
const char kSourcesListPath[] = "/etc/apt/sources.list";
const char kUsbSwitchPath[] = "/etc/vesk/usbswitch.txt";
const char kTimerPath[] = "/etc/vesk/timer.json";
const char kHomePathList[] = "/etc/vesk/.homeDir.txt";
const char kSystemPolicyPath[] = "/etc/vesk/system_policy.json";
const char KETCSessionPolicyPath[] = "/etc/vesk/session_policy.json";
const char KSessionPolicyPath[] = "%1/vesk/session_policy.json";
const char KSessionScreenSaverPath[] = "%1/vesk/screenSaver";
const char kWebpageLinkIconPath[] = "%1/icons/webpageIcon/";
const char kPamConfigPath[] = "/etc/vesk-iam.conf";
const char kUserCachePath[] = "/var/lib/libvesk-iam";
const char kScriptsPath[] = "/usr/share/vesk/scripts/";
const char kAppBlackListPath[] = "/usr/share/vesk/appblacklist.txt";
const char kSoftwareBlcakListPath[] = "/var/lib/mmcg/software_black_list.list";
const char kMMCGSoftwareListPath[] = "/var/lib/mmcg/software_list.list";
const char kVESKSoftwareListPath[] = "/var/lib/vesk/software_list.list";

const char kUrlHead[] = "https://%1:%2/";
const char KSshPort[] = "https://%1:%2/uim/v3/client/config?key=ssh_port";
const char kUsbControlInfo[] = "https://%1:%2/uim/v3/client/config?key=usbconf";
const char KPasswdExpired[] = "https://%1:%2/uim/v3/client/password/tips";
const char KAPTSourceLists[] = "https://%1:%2/uim/v3/client/system_config/repository?machine_id=%3";
const char kRulesConfigUrl[] = "https://%1:%2/uim/v3/client/system_config/safety_rules";
const char kUploadInfoUrl[] = "https://%1:%2/uim/v3/client/upload_info";
const char kUploadInfoLogUrl[] = "https://%1:%2/uim/v3/client/upinfo_log";
const char kSoftwareMarkUrl[] = "https://%1:%2/uim/software_mark?machine_id=%3";
const char kUsbWhiteListCheckUrl[] =
    "https://%1:%2/api/usb_whitelist_check?machine_id=%3&vendorId=%4&productId=%5&serialNumber=%6";
const char KControlCenterKeys[] = "https://%1:%2/policy/v1/client/all_control_center_info";
const char kPolicyTimerUrl[] = "https://%1:%2/policy/v1/client/policy_sync_setting";
const char kSystemPolicyUrl[] =
    "https://%1:%2/policy/v1/client/pc_policy_details?machine_id=%3&policy_level=system&md5=%4";
const char kSessionPolicyUrl[] =
    "https://%1:%2/policy/v1/client/pc_policy_details?machine_id=%3&policy_level=session&md5=%4";
const char kTaskReplyUrl[] = "https://%1:%2/job/v3/client/task/reply";
const char kWebsocketLoginUrl[] = "wss://%1:%2/clientapi/v1/client/login?clientID=%3&timestamp=%4";

} // namespace vesk
