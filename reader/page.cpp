#include "reader/page.h"

#include <algorithm>
#include <set>
#include <string>

#include "reader/event_text.h"
#include "reader/folded_changes.h"
#include "reader/html.h"
#include "reader/limits.h"
#include "reader/page_style.h"
#include "reader/text_encoding.h"
#include "reader/time_line.h"

namespace {

// How a state is shown without colour, and the CSS class that sets its colour.
struct StateLook {
  EventState State;
  const char* Class;
  const char* Mark;
  const char* Meaning;
};

constexpr StateLook stateLooks[] = {
    {EventState::kOk, "ok", "\u2713", "ended well"},
    {EventState::kFailed, "failed", "\u2715", "ended with a failure"},
    {EventState::kEnded, "ended", "\u2022", "ended, the result says neither"},
    {EventState::kOpen, "open", "\u2026", "started, not ended"},
    {EventState::kNoStart, "no-start", "?", "ended without a start"},
};

const StateLook& LookOf(EventState state) {
  return *std::find_if(std::begin(stateLooks), std::end(stateLooks),
                       [state](const StateLook& look) { return look.State == state; });
}

std::string Element(std::string_view tag, std::string_view content) {
  return "<" + std::string(tag) + ">" + std::string(content) + "</" + std::string(tag) + ">";
}

// Text of the history, cut if it is long.
std::string Escaped(std::string_view text) {
  return EscapeHtml(Shortened(text, kMostBytesOfPageText));
}

// Text of the history in a cell or an item of a list.
std::string TextElement(std::string_view tag, std::string_view text) {
  return Element(tag, Escaped(text));
}

// Kept apart from the text around it, whatever direction its characters have.
std::string Isolated(std::string_view text) { return TextElement("bdi", text); }

// A number, not the identity: that can be any text, and two events can share it.
std::string AnchorOf(size_t number) { return "event-" + std::to_string(number + 1); }

std::string StateBadge(EventState state) {
  const StateLook& look = LookOf(state);
  return "<span class=\"state " + std::string(look.Class) + "\"><span aria-hidden=\"true\">" +
         look.Mark + "</span> " + std::string(StateName(state)) + "</span>";
}

std::string CopyOf(const Event& event) {
  return event.Copy.empty() || event.Copy == "(Unknown)" ? "no copy" : event.Copy;
}

std::string ShortTitleOf(const Event& event) {
  return Shortened(TitleOf(event) + "; " + CourseOf(event), kMostBytesOfPageText);
}

std::vector<TimeLineBar> BarsOf(const History& history) {
  std::vector<TimeLineBar> bars;
  for (size_t i = 0; i < history.Events.size(); ++i) {
    const Event& event = history.Events[i];
    if (!event.Started && !event.Ended) {
      continue;
    }
    const StateLook& look = LookOf(event.State);
    const LocalTime begin = event.Started ? *event.Started : *event.Ended;
    const LocalTime end = std::max(begin, event.Ended.value_or(begin));
    bars.push_back({CopyOf(event), event.Identity, ShortTitleOf(event), "#" + AnchorOf(i),
                    look.Class, look.Mark, begin, end});
  }
  return bars;
}

std::string CountsOf(const ChangeCounts& counts) {
  std::string text;
  const auto add = [&text](size_t count, const char* kind) {
    if (count > 0) {
      text += (text.empty() ? "" : ", ") + std::to_string(count) + ' ' + kind;
    }
  };
  add(counts.Changed, "changed");
  add(counts.Added, "added");
  add(counts.Removed, "removed");
  return text.empty() ? "none" : text;
}

std::string ChangesCell(const Event& event) {
  return event.HasBefore && event.HasAfter ? CountsOf(event.Differences.Counts) : "not known";
}

std::string CountsLine(const History& history) {
  std::string text =
      std::to_string(history.Events.size()) + (history.Events.size() == 1 ? " event" : " events");
  for (const StateLook& look : stateLooks) {
    const auto count =
        std::count_if(history.Events.begin(), history.Events.end(),
                      [&look](const Event& event) { return event.State == look.State; });
    if (count > 0) {
      text += ", " + std::to_string(count) + ' ' + std::string(StateName(look.State));
    }
  }
  return text;
}

std::string ComputersOf(const History& history) {
  std::set<std::string_view> names;
  for (const Event& event : history.Events) {
    if (event.Computer && !event.Computer->empty()) {
      names.insert(*event.Computer);
    }
  }
  std::string text;
  for (const std::string_view name : names) {
    text.append(text.empty() ? "" : ", ").append(name);
  }
  return text;
}

// Writes the page piece by piece, as it can be many times as large as the history in memory.
class PageWriter {
 public:
  PageWriter(const History& history, const FindingList& findings, std::ostream& out)
      : Shown(history), Findings(findings), Out(out) {}

  void Write() {
    const std::string computers = ComputersOf(Shown);
    const std::string title =
        computers.empty() ? "Installation history" : "Installation history of " + computers;
    WriteHead(title);
    Out << "<body>\n<header>\n"
        << TextElement("h1", title) << "\n<p>" << EscapeHtml(CountsLine(Shown))
        << "</p>\n<p class=\"quiet\">Source: " << Isolated(Shown.Source)
        << ". Times are local to the machine.</p>\n</header>\n<main>\n";
    WriteTimeLine();
    WriteEventTable();
    WriteFindings();
    WriteDetails();
    Out << "</main>\n</body>\n</html>\n";
  }

 private:
  void WriteHead(const std::string& title) {
    // What the escaping should miss, the browser refuses: no script, nothing fetched.
    Out << "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
           "<meta http-equiv=\"Content-Security-Policy\" content=\"default-src 'none'; "
           "style-src 'unsafe-inline'; base-uri 'none'; form-action 'none'\">\n"
           "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
           "<meta name=\"color-scheme\" content=\"light dark\">\n"
        << TextElement("title", title) << "\n<style>\n"
        << kPageStyle << "</style>\n</head>\n";
  }

  // What follows scrolls by itself on a narrow screen, with the keyboard too.
  void BeginScrolling(const char* label) {
    Out << "<div class=\"scroll\" role=\"region\" tabindex=\"0\" aria-label=\"" << label << "\">\n";
  }

  void WriteTimeLine() {
    const std::vector<TimeLineBar> bars = BarsOf(Shown);
    if (bars.empty()) {
      return;
    }
    Out << "<section aria-labelledby=\"time-line\">\n<h2 id=\"time-line\">Time line</h2>\n";
    BeginScrolling("Time line");
    DrawTimeLine(bars, Out);
    Out << "</div>\n<ul class=\"legend\">";
    for (const StateLook& look : stateLooks) {
      Out << "<li>" << StateBadge(look.State) << " <span>" << look.Meaning << "</span></li>";
    }
    Out << "</ul>\n</section>\n";
  }

  void WriteEventTable() {
    Out << "<section aria-labelledby=\"events\">\n<h2 id=\"events\">Events</h2>\n";
    BeginScrolling("Events");
    Out << "<table>\n<thead><tr>";
    for (const char* title :
         {"Event", "Started", "Duration", "State", "Action", "Product", "Copy", "Changes"}) {
      Out << "<th scope=\"col\">" << title << "</th>";
    }
    Out << "</tr></thead>\n<tbody>\n";
    for (size_t i = 0; i < Shown.Events.size(); ++i) {
      WriteEventRow(Shown.Events[i], AnchorOf(i));
    }
    Out << "</tbody></table>\n</div>\n</section>\n";
  }

  void WriteEventRow(const Event& event, const std::string& anchor) {
    Out << "<tr><th scope=\"row\"><a href=\"#" << anchor << "\">"
        << Isolated(event.Identity.empty() ? "(no name)" : event.Identity) << "</a></th>"
        << TextElement("td", event.Started ? TextOfTime(*event.Started) : "")
        << TextElement("td", DurationOf(event)) << Element("td", StateBadge(event.State))
        << Element("td", Isolated(event.Action)) << Element("td", Isolated(event.Product))
        << Element("td", Isolated(CopyOf(event))) << TextElement("td", ChangesCell(event))
        << "</tr>\n";
  }

  void WriteFindings() {
    Out << "<section aria-labelledby=\"check\">\n<h2 id=\"check\">Check</h2>\n";
    Out << (Findings.empty() ? "<p>Nothing is wrong or missing in this history.</p>\n"
                             : "<ul class=\"findings\">\n");
    for (const Finding& finding : Findings) {
      const std::string_view level = LevelName(finding.Level);
      Out << "<li><span class=\"level " << level << "\">" << level << "</span> "
          << (finding.Event.empty() ? "" : "event " + Isolated(finding.Event) + ": ")
          << Isolated(finding.Text) << " <code>" << EscapeHtml(finding.Code) << "</code></li>\n";
    }
    Out << (Findings.empty() ? "" : "</ul>\n") << "</section>\n";
  }

  void WriteDetails() {
    Out << "<section aria-labelledby=\"details\">\n<h2 id=\"details\">Each event</h2>\n";
    for (size_t i = 0; i < Shown.Events.size(); ++i) {
      WriteEvent(Shown.Events[i], AnchorOf(i));
    }
    Out << "</section>\n";
  }

  // The anchor is inside: a browser that is sent there unfolds the event.
  void WriteEvent(const Event& event, const std::string& anchor) {
    Out << "<details class=\"" << LookOf(event.State).Class << "\"><summary><h3>"
        << Isolated(TitleOf(event)) << "</h3> " << StateBadge(event.State)
        << "</summary>\n<div id=\"" << anchor << "\">\n<p>" << Isolated(CourseOf(event))
        << "</p>\n";
    WriteChanges(event);
    WriteMessages(event);
    WriteFiles(event);
    WriteFacts(event);
    Out << "<p class=\"quiet\"><a href=\"#events\">All events</a></p>\n</div>\n</details>\n";
  }

  void WriteChanges(const Event& event) {
    Out << "<h4>Changes</h4>\n";
    for (const ChangeGroup& group : GroupChanges(event.Differences.List, /*showsAll=*/false)) {
      Out << "<table class=\"changes\"><caption>" << Isolated(group.Title)
          << "</caption>\n<colgroup><col class=\"kind\"><col class=\"name\"><col></colgroup>\n"
             "<thead><tr><th scope=\"col\">Change</th><th scope=\"col\">Name</th>"
             "<th scope=\"col\">Values</th></tr></thead>\n<tbody>\n";
      for (const ChangeLine& line : group.Lines) {
        WriteChange(line);
      }
      Out << "</tbody></table>\n";
    }
    WriteCategories(event, "Unchanged: ", /*isCompared=*/true);
    WriteCategories(event, "Not known, as a snapshot is missing or not whole: ",
                    /*isCompared=*/false);
  }

  void WriteChange(const ChangeLine& line) {
    const std::string_view kind = ChangeName(line.Kind);
    Out << "<tr class=\"" << kind << "\"><td class=\"kind\">" << kind << "</td><th scope=\"row\">"
        << Isolated(line.Name) << "</th>" << Element("td", Isolated(line.Value)) << "</tr>\n";
  }

  void WriteCategories(const Event& event, const char* title, bool isCompared) {
    std::string names;
    for (const Category& category : CategoriesOf(event.Differences)) {
      if (category.IsCompared == isCompared && !category.HasChanges) {
        names.append(names.empty() ? "" : ", ").append(category.Name);
      }
    }
    if (!names.empty()) {
      Out << "<p class=\"quiet\">" << title << names << "</p>\n";
    }
  }

  void WriteMessages(const Event& event) {
    if (event.Messages.empty()) {
      return;
    }
    Out << "<h4>Messages</h4>\n<ol class=\"messages\">\n";
    ForEachMessage(event, [this](std::string_view message) {
      Out << Element("li", Isolated(message)) << '\n';
    });
    Out << "</ol>\n";
  }

  void WriteFiles(const Event& event) {
    if (event.Files.empty()) {
      return;
    }
    Out << "<h4>Files</h4>\n<ul>\n";
    for (const EventFile& file : event.Files) {
      Out << "<li>" << Isolated(file.Name) << ", "
          << (file.IsPresent ? std::to_string(file.Size) + " bytes"
                             : "not in the history: " + Isolated(file.Path))
          << "</li>\n";
    }
    Out << "</ul>\n";
  }

  void WriteFacts(const Event& event) {
    Out << "<h4>Facts</h4>\n<table class=\"facts\"><tbody>\n";
    for (const Fact& fact : FactsOf(event)) {
      Out << "<tr><th scope=\"row\">" << EscapeHtml(fact.Name) << "</th>"
          << Element("td", Isolated(fact.Text)) << "</tr>\n";
    }
    Out << "</tbody></table>\n";
  }

  const History& Shown;
  const FindingList& Findings;
  std::ostream& Out;
};

}  // namespace

void WritePage(const History& history, const FindingList& findings, std::ostream& out) {
  PageWriter(history, findings, out).Write();
}
