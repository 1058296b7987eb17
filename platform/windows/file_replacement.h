#pragma once

#include <string>

#include "platform/windows/system.h"

// Opens an existing file and lets others read, write and delete it meanwhile; empty, with the
// reason in GetLastError, if that fails.
UniqueHandle OpenShared(const std::string& path, DWORD access);

// Forces the data of a file to the disk; one that is in use is waited for, up to half a second.
bool FlushToDisk(const std::string& path);

// Renames a file, over another one if there is one; a file that is in use is waited for, up to half
// a second.
bool RenameOver(const std::string& source, const std::string& target);

// Forces a new file to the disk and renames it over another one. Sharing violations are waited out,
// up to half a second each. If another program does not let the target be deleted but lets it be
// written, the contents are written into the target, which readers can see half done. False if all
// of that fails: then the target is as it was.
bool ReplaceFileBy(const std::string& source, const std::string& target);
