#pragma once

#include <optional>
#include <string>

// A host name up to its first dot.
std::string FirstLabel(const std::string& hostName);

// The first label of this machine's host name (uname), of any length; empty if the kernel has none.
std::string HostName();

// What ShortComputerName returns for that label; tests supply others.
std::optional<std::string> ShortNameOf(const std::string& label);
