#pragma once

#include <string_view>

// True for the name of a process that the operating system or its users start and end all the time,
// so that it says nothing about an installation. Case and ".exe" do not count.
bool IsSystemProcess(std::string_view name);
