#include "platform/posix/host_name.h"

#include <sys/utsname.h>

#include <cstring>

std::string HostName() {
  utsname system = {};
  ::uname(&system);
  return {system.nodename, std::strcspn(system.nodename, ".")};
}
