#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "app/install_event.h"
#include "fuzz/profile_model.h"
#include "platform/ascii_case.h"

// What the command lines of runs mean and what the history file keeps of them, as plainly as
// possible.

// A key of an event: the option that sets it, the field that holds the option's value, and the
// key's operations.
struct KeyRoute {
  const char* Key;
  std::string (CInstallEvent::*Get)() const;
  const char* Option = nullptr;
  std::string CInstallEvent::*Field = nullptr;
  void (CInstallEvent::*Set)(const std::string&) = nullptr;
};

using Event = CInstallEvent;

inline constexpr KeyRoute kKeyRoutes[] = {
    {"Event_ID", &Event::GetEventID},
    {"Complete_Flag", &Event::GetCompleteFlag},
    {"Event_Log_File", &Event::GetEventLogFile},
    {"Command_Line", &Event::GetCommandLine, "-Command", &Event::CommandLine,
     &Event::SetCommandLine},
    {"Copy_Name", &Event::GetCopyName, "-CopyName", &Event::CopyName, &Event::SetCopyName},
    {"Type", &Event::GetType, "-Type", &Event::Type, &Event::SetType},
    {"Version", &Event::GetVersion, "-Version", &Event::Version, &Event::SetVersion},
    {"Service_Level", &Event::GetServiceLevel, "-ServiceLevel", &Event::ServiceLevel,
     &Event::SetServiceLevel},
    {"Result", &Event::GetResult, "-Result", &Event::Result, &Event::SetResult},
    {"Product", &Event::GetProduct, "-Product", &Event::Product, &Event::SetProduct},
    {"Path", &Event::GetPath, "-Path", &Event::Path, &Event::SetPath},
    {"Action", &Event::GetAction, "-Action", &Event::Action, &Event::SetAction},
    {"Log_File_Name", &Event::GetLogFileName, "-l", &Event::LogFile, &Event::SetLogFileName},
    {"Trace_File", &Event::GetTraceFile, "-t", &Event::TraceFile, &Event::SetTraceFile},
    {"Response_File", &Event::GetResponseFile, "-u", &Event::ResponseFile, &Event::SetResponseFile},
};

struct CommandLineModel {
  explicit CommandLineModel(const std::vector<std::string>& words) {
    for (size_t i = 0; i + 1 < words.size(); ++i) {
      // A value is no option, whatever its text; a word that is no option takes no value.
      i += Take(words[i], words[i + 1]) ? 1 : 0;
    }
  }

  bool NamesEvent() const { return !Mode.empty() && !Identity.empty(); }

  // The value of the option that sets the key.
  std::string Value(std::string_view key) const {
    const auto found = Values.find(key);
    return found == Values.end() ? "" : found->second;
  }

  std::string Mode;
  std::string Identity;
  std::string Message;

 private:
  bool Take(const std::string& option, const std::string& value) {
    for (const char* mode : {"-start", "-end", "-logmessage"}) {
      if (EqualsIgnoringCase(option, mode)) {
        Mode = mode;
        Identity = value;
        return true;
      }
    }
    for (const KeyRoute& route : kKeyRoutes) {
      if (route.Option != nullptr && EqualsIgnoringCase(option, route.Option)) {
        Values[route.Key] = value;
        return true;
      }
    }
    const bool isMessage = EqualsIgnoringCase(option, "-message");
    Message = isMessage ? value : Message;
    return isMessage;
  }

  std::map<std::string, std::string, std::less<>> Values;
};

class HistoryModel {
 public:
  HistoryModel() : File("") { File.Set("History", "Count", "0"); }

  std::string Text() const { return File.Text(); }
  int Starts() const { return StartCount; }

  std::vector<std::string> EventSections() const {
    std::vector<std::string> sections;
    for (const std::string_view name : File.SectionNames()) {
      if (name != "History") {
        sections.emplace_back(name);
      }
    }
    return sections;
  }

  void Start(const CommandLineModel& line, const std::string& time, const std::string& logPath) {
    for (const char* key : {
#include "tests/support/event_keys.inc"
         }) {
      Set(line.Identity, key, line.Value(key));
    }
    const std::pair<const char*, std::string> others[] = {
        {"Event_ID", line.Identity}, {"Start_Time", time},        {"Copy_Name", "(Unknown)"},
        {"Complete_Flag", "FALSE"},  {"Event_Log_File", logPath}, {"Result", ""}};
    for (const auto& [key, value] : others) {
      Set(line.Identity, key, value);
    }
    File.Set("History", "Count", std::to_string(++StartCount));
  }

  void End(const CommandLineModel& line, const std::string& time) {
    Set(line.Identity, "End_Time", time);
    Set(line.Identity, "Copy_Name", line.Value("Copy_Name"));
    Set(line.Identity, "Complete_Flag", "TRUE");
    for (const std::string key :
         {"Action", "Result", "Log_File_Name", "Trace_File", "Response_File", "Path"}) {
      if (key == "Result" || !line.Value(key).empty()) {
        Set(line.Identity, key, line.Value(key));
      }
    }
  }

  void Set(const std::string& section, const std::string& key, const std::string& value) {
    File.Set(OnOneLine(section), key, OnOneLine(value));
  }

  // Without blanks and quotation marks around it; empty if it is not in the file.
  std::string Stored(const std::string& section, const std::string& key) const {
    return std::string(File.Find(OnOneLine(section), key).value_or(""));
  }

  // As an event's getter returns it.
  std::string Read(const std::string& section, const std::string& key) const {
    return Stored(section, key).substr(0, 255);
  }

  static std::string OnOneLine(std::string text) {
    for (size_t at = 0; (at = text.find("\r\n", at)) != std::string::npos;) {
      text.erase(at, 1);
    }
    std::replace(text.begin(), text.end(), '\r', ' ');
    std::replace(text.begin(), text.end(), '\n', ' ');
    return text;
  }

 private:
  ProfileModel File;
  int StartCount = 0;
};
