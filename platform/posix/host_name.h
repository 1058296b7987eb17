#pragma once

#include <optional>
#include <string>

// The host name (uname) up to its first dot, of any length; empty if the kernel has none.
std::string HostName();

// What ShortComputerName returns for a host name; tests supply others than the kernel's.
std::optional<std::string> ShortNameOf(const std::string& hostName);
