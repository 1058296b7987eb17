#include "platform/services.h"

#include "platform/windows/system.h"
#include "platform/windows/time_limit.h"

namespace {

struct ServiceCloser {
  using pointer = SC_HANDLE;
  void operator()(SC_HANDLE handle) const { ::CloseServiceHandle(handle); }
};
using UniqueService = std::unique_ptr<SC_HANDLE, ServiceCloser>;

ServiceListing ReadServices() {
  constexpr DWORD fullAccess = 0xF003F;
  const UniqueService manager(
      ::OpenSCManagerA(/*lpMachineName=*/nullptr, /*lpDatabaseName=*/nullptr, fullAccess));
  if (!manager) {
    return {::GetLastError(), {}};
  }
  DWORD needed = 0;
  DWORD count = 0;
  DWORD resume = 0;
  ::EnumServicesStatusA(manager.get(), SERVICE_WIN32, SERVICE_STATE_ALL, /*lpServices=*/nullptr,
                        /*cbBufSize=*/0, &needed, &count, &resume);
  std::vector<char> buffer(needed);
  auto* services = reinterpret_cast<ENUM_SERVICE_STATUSA*>(buffer.data());
  if (::EnumServicesStatusA(manager.get(), SERVICE_WIN32, SERVICE_STATE_ALL, services,
                            static_cast<DWORD>(buffer.size()), &needed, &count, &resume) == FALSE) {
    return {::GetLastError(), {}};
  }
  ServiceListing listing;
  for (DWORD i = 0; i < count; ++i) {
    listing.Entries.push_back({services[i].lpServiceName, services[i].lpDisplayName,
                               services[i].ServiceStatus.dwCurrentState});
  }
  return listing;
}

}  // namespace

ServiceListing ListServices(std::chrono::milliseconds limit) {
  return TimeLimit(limit).Call(&ReadServices).value_or(ServiceListing{ERROR_TIMEOUT, {}});
}
