#include "reader/system_processes.h"

#include <algorithm>
#include <iterator>

#include "platform/ascii_case.h"

bool IsSystemProcess(std::string_view name) {
  constexpr std::string_view names[] = {
      // Windows
      "alg", "applicationframehost", "audiodg", "backgroundtaskhost", "cmd", "compattelrunner",
      "conhost", "consent", "csrss", "ctfmon", "dashost", "defrag", "dllhost", "dwm", "explorer",
      "fontdrvhost", "logonui", "lsass", "lsm", "mmc", "mobsync", "mpcmdrun", "mscorsvw", "msdtc",
      "msiexec", "msmpeng", "ngen", "ngentask", "nissrv", "notepad", "powershell", "rdpclip",
      "regsvr32", "rundll32", "runtimebroker", "schtasks", "searchfilterhost", "searchindexer",
      "searchprotocolhost", "searchui", "securityhealthservice", "services", "sgrmbroker",
      "shellexperiencehost", "sihost", "slui", "smartscreen", "smss", "spoolsv", "sppsvc",
      "startmenuexperiencehost", "svchost", "taskeng", "taskhost", "taskhostex", "taskhostw",
      "taskmgr", "textinputhost", "tiworker", "trustedinstaller", "userinit", "usoclient", "vssvc",
      "wermgr", "werfault", "wininit", "winlogon", "wmiadap", "wmiapsrv", "wmiprvse", "wsmprovhost",
      "wuauclt", "wudfhost",
      // Linux
      "(sd-pam)", "agetty", "apt", "apt-get", "atd", "awk", "bash", "cat", "cron", "crond", "dash",
      "dbus-broker", "dbus-daemon", "dpkg", "grep", "journalctl", "less", "login", "mandb",
      "packagekitd", "polkitd", "rsyslogd", "run-parts", "sed", "sh", "sleep", "snapd", "sshd",
      "sshd-session", "su", "sudo", "systemctl", "systemd", "systemd-journald", "systemd-logind",
      "systemd-networkd", "systemd-resolved", "systemd-timesyncd", "systemd-udevd", "top",
      "udevadm", "unattended-upgrade", "vim"};
  constexpr std::string_view ending = ".exe";
  if (name.size() > ending.size() &&
      EqualsIgnoringCase(name.substr(name.size() - ending.size()), ending)) {
    name.remove_suffix(ending.size());
  }
  return std::any_of(std::begin(names), std::end(names),
                     [name](std::string_view known) { return EqualsIgnoringCase(name, known); });
}
