#pragma once

#include <string>

// The host name up to its first point, whatever its length; empty if the kernel does not tell it.
std::string HostName();
