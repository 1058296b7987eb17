#include <string>

#include "app/install_event.h"
#include "eventlog/logger.h"
#include "history/timestamp.h"
#include "platform/profile_file.h"

void CInstallEvent::WriteStartBlock() const {
  CLogger& log = CLogger::GetInstance();
  if (Mode != "-start") {
    return;
  }
  log << "---------- ORX Installation History Logger ( Start )----------" << GetTimestamp()
      << std::endl;
  log << "EventID       :" << EventID << std::endl;
  log << "Product       :" << Product << std::endl;
  log << "Service Level :" << ServiceLevel << std::endl;
  log << "CommandLine   :" << CommandLine << std::endl;
}

void CInstallEvent::WriteMessageBlock() const {
  // Runs of one event may overlap: under the lock, and written in one piece, no line is split.
  const ProfileGuard guard(Ini.Path);
  CLogger::GetInstance() << Message + '\n' << std::flush;
}

void CInstallEvent::WriteResultBlock() const {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(69, '=');
  log << std::endl << std::endl << std::endl << std::endl;
  log << "Result of " << GetAction() << ":" << std::endl;
  log << rule << std::endl;
  log << "Start Time                   :" << GetStartTime() << std::endl;
  log << "End   Time                   :" << GetEndTime() << std::endl;
  log << "ORX Products & Build Level   :" << GetProduct() << std::endl;
  log << "Service Level                :" << GetServiceLevel() << std::endl;
  log << "Install Type ( GUI | Silent ):" << GetType() << std::endl;
  log << "Installation Action          :" << GetAction() << std::endl;
  log << "Result                       :" << GetResult() << std::endl;
  log << "Log File Name                :" << GetLogFileName() << std::endl;
  log << "Trace File Name              :" << GetTraceFile() << std::endl;
  log << rule << std::endl;
  log << std::endl;
}

void CInstallEvent::WriteEndBlock() const {
  CLogger& log = CLogger::GetInstance();
  log << std::endl;
  log << "---------- ORX Installation History Logger ( End ) ----------" << GetTimestamp()
      << std::endl;
}
