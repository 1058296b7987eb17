#include "platform/accounts.h"

#define SECURITY_WIN32
#include "platform/windows/system_library.h"
#include "platform/windows/time_limit.h"
// These two need windows.h.
#include <lm.h>
#include <security.h>

namespace {

// Neither library is one that Windows takes from the system folder for every program, so both are
// looked up at run time. Each is loaded once in a run and never unloaded, as an abandoned call can
// still run in it.
struct NetworkLibrary {
  SystemLibrary File = SystemLibrary("netapi32.dll");
  decltype(&::NetApiBufferFree) FreeBuffer = File.Find<decltype(FreeBuffer)>("NetApiBufferFree");
  decltype(&::NetWkstaUserGetInfo) GetUserInfo =
      File.Find<decltype(GetUserInfo)>("NetWkstaUserGetInfo");
  decltype(&::NetLocalGroupEnum) ListLocal = File.Find<decltype(ListLocal)>("NetLocalGroupEnum");
  decltype(&::NetLocalGroupGetMembers) ListLocalMembers =
      File.Find<decltype(ListLocalMembers)>("NetLocalGroupGetMembers");
  decltype(&::NetGroupEnum) ListGlobal = File.Find<decltype(ListGlobal)>("NetGroupEnum");
  decltype(&::NetGroupGetUsers) ListGlobalMembers =
      File.Find<decltype(ListGlobalMembers)>("NetGroupGetUsers");

  bool IsComplete() const {
    return FreeBuffer != nullptr && GetUserInfo != nullptr && ListLocal != nullptr &&
           ListLocalMembers != nullptr && ListGlobal != nullptr && ListGlobalMembers != nullptr;
  }
};

const NetworkLibrary& NetCalls() {
  static const NetworkLibrary& library = *new NetworkLibrary;
  return library;
}

// The calls wait for other processes, some for a domain controller.
TimeLimit& LimitOfRun() {
  static TimeLimit limit(std::chrono::seconds(10));
  return limit;
}

struct NetBufferFreer {
  void operator()(BYTE* buffer) const { NetCalls().FreeBuffer(buffer); }
};
using NetBuffer = std::unique_ptr<BYTE, NetBufferFreer>;

// Empty if it does not fit: a cut name would be that of somebody else.
std::string WideToNarrow(const wchar_t* wide) {
  char narrow[128] = {};
  const int count = ::WideCharToMultiByte(CP_ACP, /*dwFlags=*/0, wide, /*cchWideChar=*/-1, narrow,
                                          sizeof narrow, /*lpDefaultChar=*/nullptr,
                                          /*lpUsedDefaultChar=*/nullptr);
  return count == 0 ? "" : narrow;
}

// Empty if it needs more than 256 characters with its terminator.
std::wstring NarrowToWide(const std::string& narrow) {
  wchar_t wide[256] = {};
  const int count = ::MultiByteToWideChar(CP_ACP, /*dwFlags=*/0, narrow.c_str(),
                                          /*cbMultiByte=*/-1, wide, 256);
  return count == 0 ? L"" : wide;
}

// Receives the result of a network call: the entire list at once, as the calls request the largest
// length.
struct NetList {
  BYTE* Buffer = nullptr;
  DWORD Count = 0;
  DWORD Total = 0;
  DWORD_PTR Resume = 0;
};

template <typename Entry, typename Call>
std::vector<std::string> ReadNames(LPWSTR Entry::*name, const Call& call) {
  std::vector<std::string> names;
  if (!NetCalls().IsComplete()) {
    return names;
  }
  NetList list;
  const bool isListed = call(list);
  const NetBuffer owner(list.Buffer);
  if (!isListed) {
    return names;
  }
  const auto* entries = reinterpret_cast<const Entry*>(list.Buffer);
  for (DWORD i = 0; entries != nullptr && i < list.Count; ++i) {
    names.push_back(WideToNarrow(entries[i].*name));
  }
  return names;
}

// The names in what the call lists; empty if it returns false or does not return in time. It must
// own what it uses.
template <typename Entry, typename Call>
std::vector<std::string> ListNames(LPWSTR Entry::*name, const Call& call) {
  return LimitOfRun()
      .Call([name, call] { return ReadNames(name, call); })
      .value_or(std::vector<std::string>());
}

std::optional<std::string> ReadDomainUserName() {
  char name[1025] = {};
  ULONG size = sizeof name;
  static const SystemLibrary& library = *new SystemLibrary("secur32.dll");
  const auto getUserName = library.Find<decltype(&::GetUserNameExA)>("GetUserNameExA");
  if (getUserName == nullptr || getUserName(NameSamCompatible, name, &size) == FALSE) {
    return std::nullopt;
  }
  return name;
}

std::optional<std::string> ReadWorkstationUserName() {
  if (!NetCalls().IsComplete()) {
    return std::nullopt;
  }
  BYTE* buffer = nullptr;
  const NET_API_STATUS status = NetCalls().GetUserInfo(/*reserved=*/nullptr, /*level=*/1, &buffer);
  const NetBuffer owner(buffer);
  if (status != NERR_Success || buffer == nullptr) {
    return std::nullopt;
  }
  return WideToNarrow(reinterpret_cast<const WKSTA_USER_INFO_1*>(buffer)->wkui1_username);
}

}  // namespace

std::optional<std::string> DomainUserName() {
  return LimitOfRun().Call(&ReadDomainUserName).value_or(std::nullopt);
}

std::optional<std::string> WorkstationUserName() {
  return LimitOfRun().Call(&ReadWorkstationUserName).value_or(std::nullopt);
}

std::vector<std::string> ListLocalGroups(const std::string& server) {
  return ListNames(&LOCALGROUP_INFO_1::lgrpi1_name, [server](NetList& list) {
    return NetCalls().ListLocal(NarrowToWide(server).c_str(), /*level=*/1, &list.Buffer,
                                MAX_PREFERRED_LENGTH, &list.Count, &list.Total,
                                &list.Resume) == NERR_Success;
  });
}

std::vector<std::string> ListLocalGroupMembers(const std::string& server,
                                               const std::string& group) {
  return ListNames(
      &LOCALGROUP_MEMBERS_INFO_2::lgrmi2_domainandname, [server, group](NetList& list) {
        NetCalls().ListLocalMembers(NarrowToWide(server).c_str(), NarrowToWide(group).c_str(),
                                    /*level=*/2, &list.Buffer, MAX_PREFERRED_LENGTH, &list.Count,
                                    &list.Total, &list.Resume);
        return true;  // what could be read counts, whatever the status says
      });
}

std::vector<std::string> ListGlobalGroups(const std::string& server) {
  return ListNames(&GROUP_INFO_2::grpi2_name, [server](NetList& list) {
    return NetCalls().ListGlobal(NarrowToWide(server).c_str(), /*level=*/2, &list.Buffer,
                                 MAX_PREFERRED_LENGTH, &list.Count, &list.Total,
                                 &list.Resume) == NERR_Success;
  });
}

std::vector<std::string> ListGlobalGroupMembers(const std::string& server,
                                                const std::string& group) {
  return ListNames(&GROUP_USERS_INFO_0::grui0_name, [server, group](NetList& list) {
    NetCalls().ListGlobalMembers(NarrowToWide(server).c_str(), NarrowToWide(group).c_str(),
                                 /*level=*/0, &list.Buffer, MAX_PREFERRED_LENGTH, &list.Count,
                                 &list.Total, &list.Resume);
    return true;  // what could be read counts, whatever the status says
  });
}
