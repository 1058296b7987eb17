#pragma once

#include <string>

// The current local time in the form "20261124 21:05:07": always 17 characters, no zone.
std::string GetTimestamp();
