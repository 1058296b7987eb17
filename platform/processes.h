#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

// The running processes, in the two ways that Windows systems have to list them.

// Windows: GetCurrentProcessId. POSIX: getpid.
uint32_t OwnProcessID();

// The IDs of all processes, at most 8192, in the system's order. Nothing if the system lacks the
// service. Windows: EnumProcesses of psapi.dll, looked up at run time. POSIX: the entries of /proc
// that are numbers.
std::optional<std::vector<uint32_t>> ListProcessIDs();

struct ProcessModule {
  std::string BaseName;  // file name without folder, at most 259 bytes; empty if it cannot be read
};

// The executable of a process; nothing if the user may not look at the process or it has ended.
// Windows: OpenProcess with access 0x410, EnumProcessModules, GetModuleBaseNameA. POSIX: the link
// /proc/ID/exe, without the " (deleted)" that the kernel adds to it.
std::optional<ProcessModule> FirstModuleOf(uint32_t processID);

struct ProcessEntry {
  uint32_t Size = 0;  // of the system's entry, in bytes, as the system left it
  uint32_t ProcessID = 0;
  std::string ExecutableFile;  // with its folder
};

// A snapshot of all processes, as Windows 95, 98 and Me list them. Nothing if the system lacks the
// service. Windows: CreateToolhelp32Snapshot, Process32First and Process32Next of
// kernel32.dll, looked up at run time. POSIX: always nothing.
std::optional<std::vector<ProcessEntry>> SnapshotProcesses();
