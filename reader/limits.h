#pragma once

#include <cstddef>
#include <cstdint>

// What the reader takes of a history at most, so that no history, however damaged or hostile, costs
// more than 256 MiB of memory. What is beyond a limit is left out, with a finding of code
// "damaged". All sizes are bytes.

// Of a folder or an archive.
inline constexpr size_t kMostFiles = 200'000;         // with its folders
inline constexpr size_t kMostBytesOfName = 4096;      // of one path
inline constexpr size_t kMostBytesOfNames = 8 << 20;  // of all paths

// Of the contents of its files.
inline constexpr uint64_t kMostBytesOfFile = 16 << 20;
inline constexpr uint64_t kMostBytesRead = 1 << 30;  // of all files; each reading counts
inline constexpr uint64_t kMostBytesOfHistoryFile = 8 << 20;
inline constexpr size_t kMostLinesOfHistoryFile = 500'000;

// Of the events. Texts count as UTF-8.
inline constexpr size_t kMostEvents = 40'000;
inline constexpr size_t kMostBytesOfFacts = 16 << 20;    // of all events
inline constexpr size_t kMostBytesOfEvent = 4 << 20;     // of the changes and messages of one
inline constexpr size_t kMostBytesOfDetails = 32 << 20;  // of those of all events

// Of one report.
inline constexpr size_t kMostMarks = 100'000;  // lines that may begin or end a block
inline constexpr size_t kMostStarts = 1000;
inline constexpr size_t kMostRows = 50'000;  // of one part of a snapshot

// Of what is shown.
inline constexpr size_t kMostBytesOfFindings = 8 << 20;  // of the source's, and of the events'
inline constexpr size_t kMostBytesOfFindingText = 1000;
inline constexpr size_t kMostBytesOfPageText = 4000;  // of one value, message or name on the page
inline constexpr size_t kWidestColumn = 60;           // columns that the list pads a cell to

// Of the files that unpack writes.
inline constexpr uint64_t kMostBytesUnpacked = uint64_t{16} << 30;
