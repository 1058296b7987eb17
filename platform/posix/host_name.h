#pragma once

#include <string>

// The host name (uname) up to its first dot, of any length; empty if the kernel has none.
std::string HostName();
