#pragma once

#include <string>

// Waits, at most 0.2 seconds, while another program keeps the file from being opened for writing.
// Returns at once if there is no such file or it cannot be opened for another reason.
// Windows: CreateFileA. POSIX: returns at once, as no program can do that.
void WaitWhileHeld(const std::string& path);
