#include "platform/posix/host_name.h"

#include <sys/utsname.h>

std::string FirstLabel(const std::string& hostName) {
  return hostName.substr(0, hostName.find('.'));
}

std::string HostName() {
  utsname system = {};
  ::uname(&system);
  return FirstLabel(system.nodename);
}

std::optional<std::string> ShortNameOf(const std::string& label) {
  constexpr size_t longest = 14;
  return !label.empty() && label.size() <= longest ? std::optional(label) : std::nullopt;
}
