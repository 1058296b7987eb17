#pragma once

#include <string>

// The host name up to its first dot, of any length; empty if the kernel has none.
std::string HostName();
