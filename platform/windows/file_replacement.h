#pragma once

#include <string>

#include "platform/windows/system.h"

// Opens an existing file and lets others read, write and delete it meanwhile; empty, with the
// reason in GetLastError, if that fails.
UniqueHandle OpenShared(const std::string& path, DWORD access);

// Forces a new file to the disk and renames it over another one. Sharing violations are waited out,
// up to half a second each. If another program does not let the target be deleted but lets it be
// written, the contents are written into the target, which readers can see half done. False if all
// of that fails: then the target is as it was.
bool ReplaceFileBy(const std::string& source, const std::string& target);
