#pragma once

#include <map>

#include "app/install_event.h"
#include "fuzz/profile_model.h"
#include "tests/support/file_text.h"

// What the command lines of runs mean and what the history file keeps of them, as plainly as
// possible.

using Event = CInstallEvent;

// An option, the key that keeps its value, and the members of the event that hold and read it.
struct OptionModel {
  const char* Option;
  const char* Key;
  std::string Event::*Field;
  std::string (Event::*Get)() const;  // null for the message, which only the log keeps
};

inline constexpr OptionModel kOptions[] = {
    {"-start", "Event_ID", &Event::EventID, &Event::GetEventID},
    {"-end", "Event_ID", &Event::EventID, &Event::GetEventID},
    {"-logmessage", "Event_ID", &Event::EventID, &Event::GetEventID},
    {"-message", "Message", &Event::Message, nullptr},
    {"-Command", "Command_Line", &Event::CommandLine, &Event::GetCommandLine},
    {"-CopyName", "Copy_Name", &Event::CopyName, &Event::GetCopyName},
    {"-Type", "Type", &Event::Type, &Event::GetType},
    {"-Version", "Version", &Event::Version, &Event::GetVersion},
    {"-ServiceLevel", "Service_Level", &Event::ServiceLevel, &Event::GetServiceLevel},
    {"-Result", "Result", &Event::Result, &Event::GetResult},
    {"-Product", "Product", &Event::Product, &Event::GetProduct},
    {"-Path", "Path", &Event::Path, &Event::GetPath},
    {"-Action", "Action", &Event::Action, &Event::GetAction},
    {"-l", "Log_File_Name", &Event::LogFile, &Event::GetLogFileName},
    {"-t", "Trace_File", &Event::TraceFile, &Event::GetTraceFile},
    {"-u", "Response_File", &Event::ResponseFile, &Event::GetResponseFile},
};

struct CommandLineModel {
  explicit CommandLineModel(const std::vector<std::string>& words) {
    for (size_t i = 0; i + 1 < words.size(); ++i) {
      for (const OptionModel& option : kOptions) {
        if (EqualsIgnoringCase(words[i], option.Option)) {
          Mode = option.Field == &Event::EventID ? option.Option : Mode;
          Values[option.Key] = words[++i];  // a value is no option, whatever its text
          break;
        }
      }
    }
  }

  bool NamesEvent() const { return !Mode.empty() && !Value("Event_ID").empty(); }

  // The last value for the key; empty without one.
  std::string Value(const std::string& key) const {
    const auto found = Values.find(key);
    return found == Values.end() ? "" : found->second;
  }

  std::string Mode;
  std::map<std::string, std::string> Values;
};

class HistoryModel {
 public:
  explicit HistoryModel(std::string_view text = "[History]\nCount=0\n") : File(text) {}

  std::string Text() const { return File.Text(); }

  std::vector<std::string> EventSections() const {
    const std::vector<std::string_view> names = File.SectionNames();
    std::vector<std::string> sections(names.begin(), names.end());
    std::erase(sections, "History");
    return sections;
  }

  void Start(const CommandLineModel& line, const std::string& time, const std::string& logPath) {
    const std::string identity = line.Value("Event_ID");
    for (const char* key : {
#include "tests/support/event_keys.inc"
         }) {
      Set(identity, key, line.Value(key));
    }
    Set(identity, "Start_Time", time);
    Set(identity, "Copy_Name", "(Unknown)");
    Set(identity, "Complete_Flag", "FALSE");
    Set(identity, "Event_Log_File", logPath);
    Set(identity, "Result", "");
    Set("History", "Count", std::to_string(++Starts));
  }

  void End(const CommandLineModel& line, const std::string& time) {
    const std::string identity = line.Value("Event_ID");
    Set(identity, "End_Time", time);
    Set(identity, "Copy_Name", line.Value("Copy_Name"));
    Set(identity, "Complete_Flag", "TRUE");
    for (const std::string key :
         {"Action", "Result", "Log_File_Name", "Trace_File", "Response_File", "Path"}) {
      if (key == "Result" || !line.Value(key).empty()) {
        Set(identity, key, line.Value(key));
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

  int Starts = 0;

 private:
  static std::string OnOneLine(const std::string& text) {
    std::string line = Replaced(text, "\r\n", "\n");
    std::replace(line.begin(), line.end(), '\r', ' ');
    std::replace(line.begin(), line.end(), '\n', ' ');
    return line;
  }

  ProfileModel File;
};
