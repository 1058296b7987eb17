#pragma once

#include <string>

// Where the history lies. No path is kept: each call works it out again. No path ends in a
// separator.

// The common application data folder of the machine, the root of it all.
std::string GetCommonAppDataPath();

// The history folder, ZEK and ORXHistory below the root.
std::string GetHistoryDir();

// The history file, History.ini in the history folder.
std::string GetHistoryFilePath();

// True if a name, put below the history folder, would lead out of it: a rooted path, one with a
// part "..", or one with a part that is a symbolic link there. Such a name is treated as a folder
// that cannot be made and a file that cannot be opened.
bool LeadsOutOfHistory(const std::string& name);

// Whether a regular file, or a folder, of that name exists. The path may stand in double quotation
// marks. A link counts as what it leads to; an empty path is neither.
bool FileExists(const std::string& path);
bool DirExists(const std::string& path);

// True when the folder exists afterwards, whoever made it: a run beside this one may do so between
// the look and the making. The folder above must exist.
bool EnsureFolder(const std::string& path);
