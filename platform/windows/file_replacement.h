#pragma once

#include <string>

// Forces the data of a file to the disk (FlushFileBuffers); waits up to half a second for a program
// that keeps it from being opened. False if that fails.
bool FlushToDisk(const std::string& path);

// Renames a file and replaces the target if it exists (MoveFileExA); waits up to half a second for
// a program that uses one of them. False if that fails.
bool RenameOver(const std::string& source, const std::string& target);

// Does both: forces a new file to the disk and renames it over the target. If another program keeps
// the target open without sharing its deletion, but lets others write, the contents are written
// into the target instead; a reader can see that half done. False if everything fails, with the
// target as it was.
bool ReplaceFileBy(const std::string& source, const std::string& target);
