#include "platform/posix/host_name.h"

#include <sys/utsname.h>

static std::string FirstLabel(const std::string& hostName) {
  return hostName.substr(0, hostName.find('.'));
}

std::string HostName() {
  utsname system = {};
  ::uname(&system);
  return FirstLabel(system.nodename);
}

std::optional<std::string> ShortNameOf(const std::string& hostName) {
  const std::string name = FirstLabel(hostName);
  constexpr size_t longest = 14;
  return !name.empty() && name.size() <= longest ? std::optional(name) : std::nullopt;
}
