#include "reader/page.h"

#include <algorithm>
#include <set>

#include "reader/check.h"
#include "reader/event_text.h"
#include "reader/folded_changes.h"
#include "reader/html.h"
#include "reader/page_style.h"
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
    {EventState::kOk, "ok", "\xE2\x9C\x93", "ended well"},
    {EventState::kFailed, "failed", "\xE2\x9C\x95", "ended with a failure"},
    {EventState::kEnded, "ended", "\xE2\x80\xA2", "ended, the result says neither"},
    {EventState::kOpen, "open", "\xE2\x80\xA6", "started, not ended"},
    {EventState::kNoStart, "no-start", "?", "ended without a start"},
};

const StateLook& LookOf(EventState state) {
  return *std::find_if(std::begin(stateLooks), std::end(stateLooks),
                       [state](const StateLook& look) { return look.State == state; });
}

std::string Element(std::string_view tag, std::string_view content) {
  return "<" + std::string(tag) + ">" + std::string(content) + "</" + std::string(tag) + ">";
}

// Text of the history in a cell or an item of a list.
std::string TextElement(std::string_view tag, std::string_view text) {
  return Element(tag, EscapeHtml(text));
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
    bars.push_back({CopyOf(event), event.Identity, TitleOf(event) + "; " + CourseOf(event),
                    "#" + AnchorOf(i), look.Class, look.Mark, begin, end});
  }
  return bars;
}

std::string Legend() {
  std::string html;
  for (const StateLook& look : stateLooks) {
    html += "<li>" + StateBadge(look.State) + " <span>" + look.Meaning + "</span></li>";
  }
  return "<ul class=\"legend\">" + html + "</ul>\n";
}

// Scrolls by itself on a narrow screen, with the keyboard too.
std::string Scrolling(std::string_view label, std::string_view content) {
  return "<div class=\"scroll\" role=\"region\" tabindex=\"0\" aria-label=\"" + std::string(label) +
         "\">\n" + std::string(content) + "</div>\n";
}

std::string TimeLineSection(const History& history) {
  const std::vector<TimeLineBar> bars = BarsOf(history);
  if (bars.empty()) {
    return "";
  }
  return "<section aria-labelledby=\"time-line\">\n<h2 id=\"time-line\">Time line</h2>\n" +
         Scrolling("Time line", DrawTimeLine(bars)) + Legend() + "</section>\n";
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

std::string EventRow(const Event& event, const std::string& anchor) {
  const std::string name = event.Identity.empty() ? "(no name)" : event.Identity;
  return "<tr><th scope=\"row\"><a href=\"#" + anchor + "\">" + Isolated(name) + "</a></th>" +
         TextElement("td", event.Started ? TextOfTime(*event.Started) : "") +
         TextElement("td", DurationOf(event)) + Element("td", StateBadge(event.State)) +
         Element("td", Isolated(event.Action)) + Element("td", Isolated(event.Product)) +
         Element("td", Isolated(CopyOf(event))) + TextElement("td", ChangesCell(event)) + "</tr>\n";
}

std::string EventTable(const History& history) {
  std::string table = "<table>\n<thead><tr>";
  for (const char* title :
       {"Event", "Started", "Duration", "State", "Action", "Product", "Copy", "Changes"}) {
    table += "<th scope=\"col\">" + std::string(title) + "</th>";
  }
  table += "</tr></thead>\n<tbody>\n";
  for (size_t i = 0; i < history.Events.size(); ++i) {
    table += EventRow(history.Events[i], AnchorOf(i));
  }
  table += "</tbody></table>\n";
  return "<section aria-labelledby=\"events\">\n<h2 id=\"events\">Events</h2>\n" +
         Scrolling("Events", table) + "</section>\n";
}

std::string FindingItem(const Finding& finding) {
  const std::string level(LevelName(finding.Level));
  const std::string event = finding.Event.empty() ? "" : "event " + Isolated(finding.Event) + ": ";
  return "<li><span class=\"level " + level + "\">" + level + "</span> " + event +
         Isolated(finding.Text) + " <code>" + EscapeHtml(finding.Code) + "</code></li>\n";
}

std::string FindingsSection(const std::vector<Finding>& findings) {
  std::string html = "<section aria-labelledby=\"check\">\n<h2 id=\"check\">Check</h2>\n";
  if (findings.empty()) {
    return html + "<p>Nothing is wrong or missing in this history.</p>\n</section>\n";
  }
  html += "<ul class=\"findings\">\n";
  for (const Finding& finding : findings) {
    html += FindingItem(finding);
  }
  return html + "</ul>\n</section>\n";
}

std::string FactsTable(const Event& event) {
  std::string html = "<h4>Facts</h4>\n<table class=\"facts\"><tbody>\n";
  for (const Fact& fact : FactsOf(event)) {
    html += "<tr><th scope=\"row\">" + EscapeHtml(fact.Name) + "</th>" +
            Element("td", Isolated(fact.Text)) + "</tr>\n";
  }
  return html + "</tbody></table>\n";
}

std::string ChangeRow(const ChangeLine& line) {
  const std::string kind(ChangeName(line.Kind));
  return "<tr class=\"" + kind + "\"><td class=\"kind\">" + kind + "</td><th scope=\"row\">" +
         Isolated(line.Name) + "</th>" + Element("td", Isolated(line.Value)) + "</tr>\n";
}

std::string CategoryList(const Event& event, const char* title, bool isCompared) {
  std::string names;
  for (const Category& category : CategoriesOf(event.Differences)) {
    if (category.IsCompared == isCompared && !category.HasChanges) {
      names.append(names.empty() ? "" : ", ").append(category.Name);
    }
  }
  return names.empty() ? "" : "<p class=\"quiet\">" + std::string(title) + names + "</p>\n";
}

std::string ChangesPart(const Event& event) {
  std::string html = "<h4>Changes</h4>\n";
  for (const ChangeGroup& group : GroupChanges(event.Differences.List, /*showsAll=*/false)) {
    html += "<table class=\"changes\"><caption>" + Isolated(group.Title) +
            "</caption>\n<colgroup><col class=\"kind\"><col class=\"name\"><col></colgroup>\n"
            "<thead><tr><th scope=\"col\">Change</th><th scope=\"col\">Name</th>"
            "<th scope=\"col\">Values</th></tr></thead>\n<tbody>\n";
    for (const ChangeLine& line : group.Lines) {
      html += ChangeRow(line);
    }
    html += "</tbody></table>\n";
  }
  return html + CategoryList(event, "Unchanged: ", /*isCompared=*/true) +
         CategoryList(event, "Not known, as a snapshot is missing or not whole: ",
                      /*isCompared=*/false);
}

std::string MessagesPart(const Event& event) {
  std::string items;
  ForEachMessage(event, [&items](std::string_view message) {
    items += Element("li", Isolated(message)) + '\n';
  });
  return items.empty() ? "" : "<h4>Messages</h4>\n<ol class=\"messages\">\n" + items + "</ol>\n";
}

std::string FilesPart(const Event& event) {
  std::string items;
  for (const EventFile& file : event.Files) {
    if (!file.Name.empty()) {
      const std::string note = file.IsPresent ? std::to_string(file.Size) + " bytes"
                                              : "not in the history: " + Isolated(file.Path);
      items += "<li>" + Isolated(file.Name) + ", " + note + "</li>\n";
    }
  }
  return items.empty() ? "" : "<h4>Files</h4>\n<ul>\n" + items + "</ul>\n";
}

// The anchor is inside: a browser that is sent there unfolds the event.
std::string EventPart(const Event& event, const std::string& anchor) {
  return "<details class=\"" + std::string(LookOf(event.State).Class) + "\"><summary><h3>" +
         Isolated(TitleOf(event)) + "</h3> " + StateBadge(event.State) + "</summary>\n<div id=\"" +
         anchor + "\">\n<p>" + Isolated(CourseOf(event)) + "</p>\n" + ChangesPart(event) +
         MessagesPart(event) + FilesPart(event) + FactsTable(event) +
         "<p class=\"quiet\"><a href=\"#events\">All events</a></p>\n</div>\n</details>\n";
}

std::string DetailsSection(const History& history) {
  std::string html = "<section aria-labelledby=\"details\">\n<h2 id=\"details\">Each event</h2>\n";
  for (size_t i = 0; i < history.Events.size(); ++i) {
    html += EventPart(history.Events[i], AnchorOf(i));
  }
  return html + "</section>\n";
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
  std::set<std::string> names;
  for (const Event& event : history.Events) {
    if (event.Computer && !event.Computer->empty()) {
      names.insert(*event.Computer);
    }
  }
  std::string text;
  for (const std::string& name : names) {
    text += (text.empty() ? "" : ", ") + name;
  }
  return text;
}

std::string Head(const std::string& title) {
  // What the escaping should miss, the browser refuses: no script, nothing fetched.
  return "<!DOCTYPE html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
         "<meta http-equiv=\"Content-Security-Policy\" content=\"default-src 'none'; "
         "style-src 'unsafe-inline'; base-uri 'none'; form-action 'none'\">\n"
         "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
         "<meta name=\"color-scheme\" content=\"light dark\">\n" +
         TextElement("title", title) + "\n<style>\n" + std::string(kPageStyle) +
         "</style>\n</head>\n";
}

}  // namespace

std::string RenderPage(const History& history, const std::vector<Finding>& findings) {
  const std::string computers = ComputersOf(history);
  const std::string title =
      computers.empty() ? "Installation history" : "Installation history of " + computers;
  return Head(title) + "<body>\n<header>\n" + TextElement("h1", title) + "\n<p>" +
         EscapeHtml(CountsLine(history)) +
         "</p>\n<p class=\"quiet\">Source: " + Isolated(history.Source) +
         ". Times are local to the machine.</p>\n</header>\n<main>\n" + TimeLineSection(history) +
         EventTable(history) + FindingsSection(findings) + DetailsSection(history) +
         "</main>\n</body>\n</html>\n";
}
