#include "platform/accounts.h"

#define SECURITY_WIN32
#include "platform/windows/system.h"
// These two need what the header above defines.
#include <lm.h>
#include <security.h>

namespace {

// Frees what the network calls hand out.
struct NetBufferFreer {
  void operator()(BYTE* buffer) const { ::NetApiBufferFree(buffer); }
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

// Where a network call puts a list: all of it at once, as the preferred length is the largest.
struct NetList {
  BYTE* Buffer = nullptr;
  DWORD Count = 0;
  DWORD Total = 0;
  DWORD_PTR Resume = 0;
};

template <typename Entry>
std::vector<std::string> NamesIn(const NetList& list, LPWSTR Entry::*name) {
  const NetBuffer owner(list.Buffer);
  const auto* entries = reinterpret_cast<const Entry*>(list.Buffer);
  std::vector<std::string> names;
  for (DWORD i = 0; entries != nullptr && i < list.Count; ++i) {
    names.push_back(WideToNarrow(entries[i].*name));
  }
  return names;
}

}  // namespace

std::optional<std::string> DomainUserName() {
  char name[1025] = {};
  ULONG size = sizeof name;
  if (::GetUserNameExA(NameSamCompatible, name, &size) == FALSE) {
    return std::nullopt;
  }
  return name;
}

std::optional<std::string> WorkstationUserName() {
  BYTE* buffer = nullptr;
  const NET_API_STATUS status = ::NetWkstaUserGetInfo(/*reserved=*/nullptr, /*level=*/1, &buffer);
  const NetBuffer owner(buffer);
  if (status != NERR_Success || buffer == nullptr) {
    return std::nullopt;
  }
  return WideToNarrow(reinterpret_cast<const WKSTA_USER_INFO_1*>(buffer)->wkui1_username);
}

std::vector<std::string> ListLocalGroups(const std::string& server) {
  NetList list;
  if (::NetLocalGroupEnum(NarrowToWide(server).c_str(), /*level=*/1, &list.Buffer,
                          MAX_PREFERRED_LENGTH, &list.Count, &list.Total,
                          &list.Resume) != NERR_Success) {
    list.Count = 0;
  }
  return NamesIn(list, &LOCALGROUP_INFO_1::lgrpi1_name);
}

std::vector<std::string> ListLocalGroupMembers(const std::string& server,
                                               const std::string& group) {
  NetList list;
  ::NetLocalGroupGetMembers(NarrowToWide(server).c_str(), NarrowToWide(group).c_str(), /*level=*/2,
                            &list.Buffer, MAX_PREFERRED_LENGTH, &list.Count, &list.Total,
                            &list.Resume);
  return NamesIn(list, &LOCALGROUP_MEMBERS_INFO_2::lgrmi2_domainandname);
}

std::vector<std::string> ListGlobalGroups(const std::string& server) {
  NetList list;
  if (::NetGroupEnum(NarrowToWide(server).c_str(), /*level=*/2, &list.Buffer, MAX_PREFERRED_LENGTH,
                     &list.Count, &list.Total, &list.Resume) != NERR_Success) {
    list.Count = 0;
  }
  return NamesIn(list, &GROUP_INFO_2::grpi2_name);
}

std::vector<std::string> ListGlobalGroupMembers(const std::string& server,
                                                const std::string& group) {
  NetList list;
  ::NetGroupGetUsers(NarrowToWide(server).c_str(), NarrowToWide(group).c_str(), /*level=*/0,
                     &list.Buffer, MAX_PREFERRED_LENGTH, &list.Count, &list.Total, &list.Resume);
  return NamesIn(list, &GROUP_USERS_INFO_0::grui0_name);
}
