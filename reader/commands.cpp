#include "reader/commands.h"

#include <algorithm>
#include <fstream>
#include <functional>
#include <iostream>

#include "history/locations.h"
#include "platform/files.h"
#include "platform/temporary_file.h"
#include "reader/check.h"
#include "reader/event_text.h"
#include "reader/hits.h"
#include "reader/json.h"
#include "reader/page.h"
#include "reader/progress.h"
#include "reader/source.h"
#include "reader/text_encoding.h"
#include "reader/unpack.h"
#include "reader/views.h"

namespace {

constexpr int kDone = 0;
constexpr int kFound = 1;  // check; for find: nothing
constexpr int kFailed = 2;

int Fail(const std::string& text) {
  std::cerr << "orxhistory: " << Printable(text) << std::endl;
  return kFailed;
}

// What the source found when it was read comes first.
FindingList FindingsOf(const History& history, const Source& source) {
  FindingList findings = source.Findings;
  for (const Finding& finding : CheckHistory(history)) {
    findings.Add(finding);
  }
  return findings;
}

bool HasError(const Source& source) {
  return std::any_of(source.Findings.begin(), source.Findings.end(),
                     [](const Finding& finding) { return finding.Level == FindingLevel::kError; });
}

class Session {
 public:
  Session(const CommandLine& line, const TextDecoder& decoder, const ViewOptions& options)
      : Line(line), Decoder(decoder), Options(options), Argument(ToUtf8(line.Argument)) {}

  int List();
  int ShowEvent();
  int Find();
  int Check();
  int Page();

 private:
  std::string ToUtf8(const std::string& text) const {
    return Decoder.ToUtf8(SystemTextToUtf8(text));
  }

  // Reads one history after another and passes each on. The result is kFailed if one of them
  // cannot be read; the others are passed on all the same.
  int ForEachHistory(Detail detail, const std::optional<std::string>& identity,
                     const std::function<void(const History&, const Source&)>& use);
  bool IsListed(const Event& event) const;
  void PrintJson(const std::string& object) const { std::cout << object << '\n'; }
  void PrintSourceTitle(const History& history) const;
  void PrintHit(const History& history, const Event& event, const Hit& hit) const;
  bool WritePageFile(const History& history, const FindingList& findings) const;

  const CommandLine& Line;
  const TextDecoder& Decoder;
  const ViewOptions& Options;
  const std::string Argument;
};

int Session::ForEachHistory(Detail detail, const std::optional<std::string>& identity,
                            const std::function<void(const History&, const Source&)>& use) {
  const std::vector<std::string> names =
      Line.From.empty() ? std::vector{GetHistoryDir()} : Line.From;
  int result = kDone;
  for (const std::string& name : names) {
    std::string error;
    const std::unique_ptr<Source> source = OpenSource(name, error);
    if (!source) {
      result = Fail(error + (Line.From.empty() ? " Name a history with --from." : ""));
      continue;
    }
    History history;
    {
      Progress progress("reports");
      source->OnRead = [&progress] { progress.CountOne(); };
      history = ReadHistory(*source, Decoder, detail, identity);
    }
    if (Line.What != Command::kCheck && HasError(*source)) {
      const std::string text = "Not all of " + source->Name + " can be read: ";
      if (history.Events.empty()) {
        result = Fail(text + source->Findings.begin()->Text);
        continue;
      }
      Fail(text + "orxhistory check says what is missing.");
    }
    use(history, *source);
  }
  return result;
}

bool Session::IsListed(const Event& event) const {
  return (!Line.OnlyFailed || event.State == EventState::kFailed) &&
         (!Line.OnlyOpen || event.State == EventState::kOpen) &&
         (!Line.Copy || event.Copy == ToUtf8(*Line.Copy));
}

// Says which history follows, if there are several.
void Session::PrintSourceTitle(const History& history) const {
  if (Line.From.size() > 1) {
    std::cout << Painted(Printable(history.Source), Colour::kBold, Options) << '\n';
  }
}

int Session::List() {
  return ForEachHistory(Detail::kCounts, std::nullopt,
                        [this](const History& history, const Source&) {
                          std::vector<const Event*> events;
                          for (const Event& event : history.Events) {
                            if (IsListed(event)) {
                              events.push_back(&event);
                            }
                          }
                          if (!Line.IsJson) {
                            PrintSourceTitle(history);
                            std::cout << ListText(events, Options);
                            return;
                          }
                          for (const Event* event : events) {
                            PrintJson(EventJson(history.Source, *event));
                          }
                        });
}

int Session::ShowEvent() {
  size_t found = 0;
  const int result =
      ForEachHistory(Detail::kAll, Argument, [&](const History& history, const Source&) {
        for (const Event& event : history.Events) {
          ++found;
          if (!Line.IsJson) {
            std::cout << (found > 1 ? "\n" : "");
            PrintSourceTitle(history);
            std::cout << (Line.What == Command::kShow ? ShowText(event, Options)
                                                      : ChangesText(event, Options));
          } else if (Line.What == Command::kShow) {
            PrintJson(EventDetailsJson(history.Source, event));
          } else {
            for (const Change& change : event.Differences.List) {
              PrintJson(ChangeJson(history.Source, event, change));
            }
          }
        }
      });
  return found > 0 || result != kDone
             ? result
             : Fail("There is no event " + Argument + "; orxhistory list shows those that are.");
}

int Session::Find() {
  bool isFound = false;
  const int result =
      ForEachHistory(Detail::kAll, std::nullopt, [&](const History& history, const Source&) {
        for (const Event& event : history.Events) {
          ForEachHit(event, Argument, [&](const Hit& hit) {
            isFound = true;
            PrintHit(history, event, hit);
          });
        }
      });
  return result != kDone ? result : isFound ? kDone : kFound;
}

void Session::PrintHit(const History& history, const Event& event, const Hit& hit) const {
  if (Line.IsJson) {
    PrintJson(HitJson(history.Source, event, hit.Kind, hit.Name, hit.Text));
    return;
  }
  const auto time = event.Started ? event.Started : event.Ended;
  std::cout << Printable(Line.From.size() > 1 ? history.Source + "  " : "")
            << Printable(event.Identity) << "  " << (time ? TextOfTime(*time) : "-") << "  "
            << (hit.Kind == "fact" ? hit.Name : hit.Kind) << ": " << Printable(hit.Text) << '\n';
}

int Session::Check() {
  bool isClean = true;
  const int result =
      ForEachHistory(Detail::kAll, std::nullopt, [&](const History& history, const Source& source) {
        const FindingList findings = FindingsOf(history, source);
        for (const Finding& finding : findings) {
          isClean = isClean && finding.Level == FindingLevel::kNote;
          if (Line.IsJson) {
            PrintJson(FindingJson(history.Source, finding));
          }
        }
        if (!Line.IsJson) {
          PrintSourceTitle(history);
          std::cout << FindingsText(findings, Options);
        }
      });
  return result != kDone ? result : isClean ? kDone : kFound;
}

int Session::Page() {
  bool isWritten = true;
  const int result =
      ForEachHistory(Detail::kAll, std::nullopt, [&](const History& history, const Source& source) {
        isWritten = WritePageFile(history, FindingsOf(history, source));
      });
  return result == kDone && !isWritten ? kFailed : result;
}

// An older page of that name is replaced, but nothing that a history is read from.
bool Session::WritePageFile(const History& history, const FindingList& findings) const {
  if (!Line.From.empty() && IsSameFile(Line.Argument, Line.From.front())) {
    Fail("The page would replace the history; name another file.");
    return false;
  }
  TemporaryFile file(Line.Argument);
  std::ofstream stream(file.Path(), std::ios::binary);
  WritePage(history, findings, stream);
  stream.close();
  if (!file.Exists() || !stream || !file.Replace()) {
    Fail(Argument + " cannot be written; name a file in a folder that you may write to.");
    return false;
  }
  return true;
}

int Unpack(const CommandLine& line) {
  UnpackResult result;
  {
    Progress progress("files");
    result = UnpackArchive(line.From.front(), line.Argument, [&progress] { progress.CountOne(); });
  }
  if (!result.IsDone) {
    return Fail(result.Error);
  }
  for (const std::string& text : result.LeftOut) {
    Fail(text);
  }
  std::cout << result.Restored << (result.Restored == 1 ? " file" : " files") << " restored, "
            << result.LeftOut.size() << " left out\n";
  return result.LeftOut.empty() ? kDone : kFailed;
}

}  // namespace

int RunCommand(const CommandLine& line, const ViewOptions& options) {
  const std::optional<TextDecoder> decoder =
      line.Encoding.empty() ? TextDecoder() : TextDecoder::Open(line.Encoding);
  if (!decoder) {
    return Fail("The encoding " + line.Encoding +
                " is not known here; name another, such as CP932 or ISO-8859-2.");
  }
  Session session(line, *decoder, options);
  switch (line.What) {
    case Command::kList:
      return session.List();
    case Command::kShow:
    case Command::kChanges:
      return session.ShowEvent();
    case Command::kFind:
      return session.Find();
    case Command::kCheck:
      return session.Check();
    case Command::kPage:
      return session.Page();
    case Command::kUnpack:
      return Unpack(line);
  }
  return kFailed;
}
