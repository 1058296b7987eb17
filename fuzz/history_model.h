#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/profile_model.h"
#include "platform/ascii_case.h"

// What the command lines of runs say and what the history file keeps of them, told as plainly as
// possible.

struct CommandLineModel {
  explicit CommandLineModel(const std::vector<std::string>& words) {
    for (size_t i = 0; i + 1 < words.size(); ++i) {
      for (const char* option : {"-start", "-end", "-logmessage", "-Command", "-message",
                                 "-CopyName", "-Type", "-Version", "-ServiceLevel", "-Result",
                                 "-Product", "-Path", "-Action", "-l", "-t", "-u"}) {
        if (EqualsIgnoringCase(words[i], option)) {
          Take(option, words[i + 1]);
          ++i;  // a value is no option, whatever it says; what no option owns is looked at itself
          break;
        }
      }
    }
  }

  bool NamesEvent() const { return !Mode.empty() && !Identity.empty(); }

  const std::string& Value(const std::string& option) const {
    static const std::string none;
    const auto found = Values.find(option);
    return found == Values.end() ? none : found->second;
  }

  std::string Mode;
  std::string Identity;

 private:
  void Take(const std::string& option, const std::string& value) {
    if (option == "-start" || option == "-end" || option == "-logmessage") {
      Mode = option;
      Identity = value;
    } else {
      Values[option] = value;
    }
  }

  std::map<std::string, std::string> Values;
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
    const std::pair<const char*, std::string> keys[] = {
        {"Event_ID", line.Identity},
        {"Command_Line", line.Value("-Command")},
        {"Start_Time", time},
        {"End_Time", ""},
        {"Action", line.Value("-Action")},
        {"Type", line.Value("-Type")},
        {"Product", line.Value("-Product")},
        {"Version", line.Value("-Version")},
        {"Service_Level", line.Value("-ServiceLevel")},
        {"Path", line.Value("-Path")},
        {"Copy_Name", "(Unknown)"},
        {"Complete_Flag", "FALSE"},
        {"Log_File_Name", line.Value("-l")},
        {"Trace_File", line.Value("-t")},
        {"Response_File", line.Value("-u")},
        {"Event_Log_File", logPath},
        {"Result", ""},
    };
    for (const auto& [key, value] : keys) {
      Set(line.Identity, key, value);
    }
    File.Set("History", "Count", std::to_string(++StartCount));
  }

  void End(const CommandLineModel& line, const std::string& time) {
    Set(line.Identity, "End_Time", time);
    Set(line.Identity, "Copy_Name", line.Value("-CopyName"));
    Set(line.Identity, "Complete_Flag", "TRUE");
    SetIfGiven(line.Identity, "Action", line.Value("-Action"));
    Set(line.Identity, "Result", line.Value("-Result"));
    SetIfGiven(line.Identity, "Log_File_Name", line.Value("-l"));
    SetIfGiven(line.Identity, "Trace_File", line.Value("-t"));
    SetIfGiven(line.Identity, "Response_File", line.Value("-u"));
    SetIfGiven(line.Identity, "Path", line.Value("-Path"));
  }

  void Set(const std::string& section, const std::string& key, const std::string& value) {
    File.Set(OnOneLine(section), key, OnOneLine(value));
  }

  // Without the limit of a getter; empty if there is none.
  std::string Stored(const std::string& section, const std::string& key) const {
    return std::string(File.Find(OnOneLine(section), key).value_or(""));
  }

  // As an event's getter returns it.
  std::string Read(const std::string& section, const std::string& key) const {
    return Stored(section, key).substr(0, 255);
  }

  static std::string OnOneLine(std::string text) {
    for (size_t place = 0; (place = text.find("\r\n", place)) != std::string::npos;) {
      text.erase(place, 1);
    }
    std::replace(text.begin(), text.end(), '\r', ' ');
    std::replace(text.begin(), text.end(), '\n', ' ');
    return text;
  }

 private:
  void SetIfGiven(const std::string& section, const std::string& key, const std::string& value) {
    if (!value.empty()) {
      Set(section, key, value);
    }
  }

  ProfileModel File;
  int StartCount = 0;
};
