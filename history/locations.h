#pragma once

#include <string>

#include "platform/files.h"

// The paths of the history. None is cached: each call computes it again.

// The common application data folder of the machine, as GetFolderPath (platform/known_folders.h)
// returns it; "C:\Documents and Settings\All Users\Application Data" if the system knows none.
std::string GetCommonAppDataPath();

// The maker's folder, ZEK in the common application data folder.
std::string GetMakerDir();

// The history folder, ORXHistory in the maker's folder.
std::string GetHistoryDir();

// The history file, History.ini in the history folder.
std::string GetHistoryFilePath();

// Creates the maker's folder and the history folder unless they exist. False if one of them does
// not exist afterwards, or is a link, which any user could have created before the first run; its
// path is then stored in "failed".
bool EnsureHistoryDir(std::string& failed);

// True if the history folder exists and neither it nor the maker's folder is a link.
bool HistoryDirExists();

// True if a name, below the history folder, would lead to anything but a file or folder of that
// name there: a rooted path, one with a part "..", one with a part that the system changes or takes
// for a device (IsKeptName), or one with a part that is a symbolic link. Such a name is treated as
// a folder that cannot be made and a file that cannot be opened.
bool LeadsElsewhere(const std::string& name);

// False if the folder of an event cannot have that name, below the history folder: it leads
// elsewhere, or the path of the event's log would be too long (FitsPathLimit).
bool CanHoldEvent(const std::string& name);

// Whether a regular file, or a folder, of that name exists. The path may be enclosed in double
// quotation marks. A link counts as its target; an empty path is neither.
bool FileExists(const std::string& path);
bool DirExists(const std::string& path);

// True if the folder exists afterwards, even if an overlapping run made it. The parent must exist.
bool EnsureFolder(const std::string& path);
