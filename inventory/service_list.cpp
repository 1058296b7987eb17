#include "inventory/service_list.h"

#include <iomanip>

#include "eventlog/logger.h"
#include "inventory/filter.h"
#include "inventory/shown_name.h"
#include "platform/services.h"

static const char* StateWord(uint32_t state) {
  switch (state) {
    case 1:
      return "Stopped";
    case 2:
      return "Is starting";
    case 3:
      return "Is stopping";
    case 4:
      return "Started";
    case 5:
      return "The service continue is pending";
    case 6:
      return "The service pause is pending";
    case 7:
      return "Paused";
    default:
      return "Uknown";
  }
}

int32_t CServicesList::Collect() {
  Services.clear();
  const ServiceListing listing = ListServices(std::chrono::seconds(2));
  for (const ServiceEntry& entry : listing.Entries) {
    Services.push_back({entry.ServiceName, entry.DisplayName, StateWord(entry.CurrentState)});
  }
  return static_cast<int32_t>(listing.Error);
}

bool CServicesList::Matches(const CServiceInfo& service) const {
  return MatchesFilter(g_ServiceFilter, service.DisplayName);
}

int32_t CServicesList::Print() {
  CLogger& log = CLogger::GetInstance();
  const std::string rule = std::string(68, '-') + ' ';
  log << std::endl;
  log << rule << std::endl;
  log << "Service Name                                                Status   " << std::endl;
  log << rule << std::endl;
  for (const CServiceInfo& service : Services) {
    if (Matches(service)) {
      log << std::left << std::setfill(' ') << std::setw(60) << ShownName(service.DisplayName)
          << service.Status << std::endl;
    }
  }
  log << rule << std::endl;
  return 0;
}
