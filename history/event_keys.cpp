#include "app/install_event.h"

std::string CInstallEvent::ReadKey(const char* key) const {
  return Ini.ReadString(EventID, key, "", 256);
}

void CInstallEvent::WriteKey(const char* key, const std::string& value) {
  Ini.WriteString(EventID, key, value);
}

std::string CInstallEvent::GetLogFileName() const { return ReadKey("Log_File_Name"); }

std::string CInstallEvent::GetTraceFile() const { return ReadKey("Trace_File"); }

std::string CInstallEvent::GetResponseFile() const { return ReadKey("Response_File"); }

std::string CInstallEvent::GetCopyName() const { return ReadKey("Copy_Name"); }

std::string CInstallEvent::GetAction() const { return ReadKey("Action"); }

std::string CInstallEvent::GetCommandLine() const { return ReadKey("Command_Line"); }

std::string CInstallEvent::GetPath() const { return ReadKey("Path"); }

std::string CInstallEvent::GetEventLogFile() const { return ReadKey("Event_Log_File"); }

std::string CInstallEvent::GetEventID() const { return ReadKey("Event_ID"); }

std::string CInstallEvent::GetResult() const { return ReadKey("Result"); }

std::string CInstallEvent::GetType() const { return ReadKey("Type"); }

std::string CInstallEvent::GetCompleteFlag() const { return ReadKey("Complete_Flag"); }

std::string CInstallEvent::GetWiLogFile() const { return ReadKey("Wi_Log_File"); }

std::string CInstallEvent::GetEndTime() const { return ReadKey("End_Time"); }

std::string CInstallEvent::GetStartTime() const { return ReadKey("Start_Time"); }

std::string CInstallEvent::GetVersion() const { return ReadKey("Version"); }

std::string CInstallEvent::GetServiceLevel() const { return ReadKey("Service_Level"); }

std::string CInstallEvent::GetProduct() const { return ReadKey("Product"); }

void CInstallEvent::SetLogFileName(const std::string& value) { WriteKey("Log_File_Name", value); }

void CInstallEvent::SetTraceFile(const std::string& value) { WriteKey("Trace_File", value); }

void CInstallEvent::SetResponseFile(const std::string& value) { WriteKey("Response_File", value); }

void CInstallEvent::SetCopyName(const std::string& value) { WriteKey("Copy_Name", value); }

void CInstallEvent::SetAction(const std::string& value) { WriteKey("Action", value); }

void CInstallEvent::SetCommandLine(const std::string& value) { WriteKey("Command_Line", value); }

void CInstallEvent::SetPath(const std::string& value) { WriteKey("Path", value); }

void CInstallEvent::SetEventLogFile(const std::string& value) { WriteKey("Event_Log_File", value); }

void CInstallEvent::SetEventID(const std::string& value) { WriteKey("Event_ID", value); }

void CInstallEvent::SetResult(const std::string& value) { WriteKey("Result", value); }

void CInstallEvent::SetType(const std::string& value) { WriteKey("Type", value); }

void CInstallEvent::SetCompleteFlag(const std::string& value) { WriteKey("Complete_Flag", value); }

void CInstallEvent::SetWiLogFile(const std::string& value) { WriteKey("Wi_Log_File", value); }

void CInstallEvent::SetEndTime(const std::string& value) { WriteKey("End_Time", value); }

void CInstallEvent::SetStartTime(const std::string& value) { WriteKey("Start_Time", value); }

void CInstallEvent::SetVersion(const std::string& value) { WriteKey("Version", value); }

void CInstallEvent::SetServiceLevel(const std::string& value) { WriteKey("Service_Level", value); }

void CInstallEvent::SetProduct(const std::string& value) { WriteKey("Product", value); }
