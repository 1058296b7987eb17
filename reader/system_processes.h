#pragma once

#include <string_view>

// True for the name of a process that the operating system, or whoever is logged on to it, starts
// and ends all the time: it says nothing about an installation. Case and ".exe" do not count.
bool IsSystemProcess(std::string_view name);
