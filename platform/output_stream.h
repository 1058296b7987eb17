#pragma once

#include <fstream>
#include <string>

// Opens a stream on a text file: with std::ios::out it empties an existing file, with std::ios::app
// it writes at its end. A missing file is created, a missing folder is not. If the file cannot be
// opened, the stream stays closed and in its failure state.
// Windows: std::ofstream; another program that keeps the file from being opened for writing is
// waited for, at most 0.2 seconds (CreateFileA). POSIX: std::ofstream, as no program can do that;
// an interrupted call is repeated.
void OpenStream(std::ofstream& stream, const std::string& path, std::ios_base::openmode mode);
