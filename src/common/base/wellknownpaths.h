// SPDX-License-Identifier: Apache-2.0
#pragma once

// Every file and URL template that the programs of this product share. Sibling services link against these
// names, odd ones included. All are UTF-8 literals, converted to QString where they are used.
//
// Paths are absolute; "%1" in a path stands for a base directory that the caller supplies. In a URL template
// "%1" is the host of the server, "%2" its port; "%3" and up are the values that the query keys name.

namespace vesk {

// What the enrolment client itself reads or writes.
extern const char kUserinfoPath[];      // installed terminal record
extern const char kMachineidPath[];     // machine identity, plain text
extern const char kServerCertPath[];    // CA of the management server of a joined terminal
extern const char kPublicKeyPath[];     // certificate of a joined terminal
extern const char kPrivateKeyPath[];    // private key of a joined terminal
extern const char kTmpCaCertPath[];     // CA fetched by the wizard, before joining
extern const char kTmpPrivateKeyPath[]; // private key from the join reply, until it is installed
extern const char kTmpPublicKeyPath[];  // certificate from the join reply, until it is installed
extern const char kBackupConfigPath[];  // INI file with the desktop settings from before the join
extern const char KPCRegular[];         // rule that a terminal alias must obey

// Paths of the sibling services.
extern const char kTmpUserinfoPath[];
extern const char kVeskConfigPath[];
extern const char kCaCertPath[];
extern const char kPicPath[];
extern const char kBackupSSHConfigPath[];
extern const char kSSHConfigPath[];
extern const char kBackupSourcesListPath[];
extern const char kBackupAppstoreListPath[];
extern const char kAppstoreListPath[];
extern const char kAppstoreSourcesListPath[];
extern const char kSourcesListPath[];
extern const char kUsbSwitchPath[];
extern const char kTimerPath[];
extern const char kHomePathList[];
extern const char kSystemPolicyPath[];
extern const char KETCSessionPolicyPath[];
extern const char KSessionPolicyPath[];
extern const char KSessionScreenSaverPath[];
extern const char kWebpageLinkIconPath[];
extern const char kPamConfigPath[];
extern const char kUserCachePath[];
extern const char kScriptsPath[];
extern const char kAppBlackListPath[];
extern const char kSoftwareBlcakListPath[];
extern const char kMMCGSoftwareListPath[];
extern const char kVESKSoftwareListPath[];

// URL templates of the sibling services.
extern const char kUrlHead[];
extern const char KSshPort[];
extern const char kUsbControlInfo[];
extern const char KPasswdExpired[];
extern const char KAPTSourceLists[];
extern const char kRulesConfigUrl[];
extern const char kUploadInfoUrl[];
extern const char kUploadInfoLogUrl[];
extern const char kSoftwareMarkUrl[];
extern const char kUsbWhiteListCheckUrl[];
extern const char KControlCenterKeys[];
extern const char kPolicyTimerUrl[];
extern const char kSystemPolicyUrl[];
extern const char kSessionPolicyUrl[];
extern const char kTaskReplyUrl[];
extern const char kWebsocketLoginUrl[];

} // namespace vesk
