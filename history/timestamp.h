#pragma once

#include <string>

// The current local time in the form "20261124 21:05:07": 17 characters, without a time
// zone. By time and localtime.
std::string GetTimestamp();
