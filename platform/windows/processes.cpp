#include "platform/processes.h"

#include "platform/windows/system_library.h"
// These two need windows.h.
#include <psapi.h>
#include <tlhelp32.h>

namespace {

// Loaded once in a run: it is used for every process.
struct ProcessLibrary {
  SystemLibrary File = SystemLibrary("psapi.dll");
  decltype(&::EnumProcesses) Enum = File.Find<decltype(Enum)>("EnumProcesses");
  decltype(&::EnumProcessModules) EnumModules =
      File.Find<decltype(EnumModules)>("EnumProcessModules");
  decltype(&::GetModuleBaseNameA) GetBaseName =
      File.Find<decltype(GetBaseName)>("GetModuleBaseNameA");
  decltype(&::GetModuleFileNameExA) GetFileName =
      File.Find<decltype(GetFileName)>("GetModuleFileNameExA");

  static const ProcessLibrary& GetInstance() {
    static const ProcessLibrary instance;
    return instance;
  }
  bool IsComplete() const {
    return Enum != nullptr && EnumModules != nullptr && GetBaseName != nullptr &&
           GetFileName != nullptr;
  }
};

struct SnapshotLibrary {
  SystemLibrary File = SystemLibrary("kernel32.dll");
  decltype(&::CreateToolhelp32Snapshot) Create =
      File.Find<decltype(Create)>("CreateToolhelp32Snapshot");
  decltype(&::Process32First) First = File.Find<decltype(First)>("Process32First");
  decltype(&::Process32Next) Next = File.Find<decltype(Next)>("Process32Next");
  decltype(&::Module32First) FirstModule = File.Find<decltype(FirstModule)>("Module32First");
  decltype(&::Module32Next) NextModule = File.Find<decltype(NextModule)>("Module32Next");

  bool IsComplete() const {
    return Create != nullptr && First != nullptr && Next != nullptr && FirstModule != nullptr &&
           NextModule != nullptr;
  }
};

}  // namespace

uint32_t OwnProcessID() { return ::GetCurrentProcessId(); }

std::optional<std::vector<uint32_t>> ListProcessIDs() {
  const ProcessLibrary& library = ProcessLibrary::GetInstance();
  DWORD ids[8192] = {};
  DWORD bytes = 0;
  if (!library.IsComplete() || library.Enum(ids, sizeof ids, &bytes) == FALSE) {
    return std::nullopt;
  }
  return std::vector<uint32_t>(ids, ids + bytes / sizeof *ids);
}

std::optional<ProcessModule> FirstModuleOf(uint32_t processID) {
  const ProcessLibrary& library = ProcessLibrary::GetInstance();
  constexpr DWORD access = 0x410;  // query information, read memory
  const UniqueHandle process(::OpenProcess(access, /*bInheritHandle=*/FALSE, processID));
  HMODULE modules[65456 / sizeof(HMODULE)] = {};
  DWORD bytes = 0;
  if (!library.IsComplete() || !process ||
      library.EnumModules(process.get(), modules, sizeof modules, &bytes) == FALSE) {
    return std::nullopt;
  }
  char name[260] = {};
  library.GetBaseName(process.get(), modules[0], name, sizeof name);
  name[sizeof name - 1] = '\0';  // a name that fills the buffer comes without an end
  return ProcessModule{name};
}

std::optional<std::vector<ProcessEntry>> SnapshotProcesses() {
  const SnapshotLibrary library;
  if (!library.IsComplete()) {
    return std::nullopt;
  }
  const UniqueHandle snapshot = OwnIfValid(library.Create(TH32CS_SNAPPROCESS, /*th32ProcessID=*/0));
  if (!snapshot) {
    return std::nullopt;
  }
  static_assert(sizeof(PROCESSENTRY32) == 304);
  std::vector<ProcessEntry> entries;
  PROCESSENTRY32 entry = {};
  entry.dwSize = sizeof entry;
  for (BOOL isThere = library.First(snapshot.get(), &entry); isThere != FALSE;
       isThere = library.Next(snapshot.get(), &entry)) {
    entries.push_back({entry.dwSize, entry.th32ProcessID, entry.szExeFile});
  }
  return entries;
}
