#include <algorithm>
#include <map>
#include <string_view>

#include "reader/event_text.h"
#include "reader/folded_changes.h"
#include "reader/views.h"

namespace {

// The column of the values: after the longest name, but not too far to the right.
size_t ColumnOfValues(const std::vector<ChangeGroup>& groups) {
  constexpr size_t most = 40;
  size_t column = 0;
  for (const ChangeGroup& group : groups) {
    for (const ChangeLine& line : group.Lines) {
      const size_t used = line.Value.empty() ? 0 : ColumnsOf(Printable(line.Name));
      column = used <= most ? std::max(column, used) : column;
    }
  }
  return column;
}

Colour ColourOf(ChangeKind kind) {
  return kind == ChangeKind::kAdded     ? Colour::kGreen
         : kind == ChangeKind::kRemoved ? Colour::kRed
                                        : Colour::kPlain;
}

std::string LineOf(const ChangeLine& line, size_t column, const ViewOptions& options) {
  const char* signs[] = {"+ ", "- ", "  "};
  std::string text = signs[static_cast<size_t>(line.Kind)];
  const std::string name = Printable(line.Name);
  text += line.Value.empty() ? name : PaddedTo(name, column) + "  " + Printable(line.Value);
  return Painted(text, ColourOf(line.Kind), options) + "\n";
}

// "unchanged: user, groups", empty without any.
std::string SummaryLine(std::string_view title, const std::vector<std::string_view>& names) {
  std::string line;
  for (const std::string_view name : names) {
    line.append(line.empty() ? title : ", ").append(name);
  }
  return line.empty() ? "" : line + "\n";
}

std::string SummaryOf(const Event& event) {
  std::vector<std::string_view> unchanged;
  std::vector<std::string_view> unknown;
  for (const Category& category : CategoriesOf(event.Differences)) {
    if (!category.IsCompared) {
      unknown.push_back(category.Name);
    } else if (!category.HasChanges) {
      unchanged.push_back(category.Name);
    }
  }
  const char* reason = !event.HasBefore && !event.HasAfter
                           ? "not known (no snapshot in the report): "
                       : !event.HasBefore ? "not known (no snapshot before): "
                       : !event.HasAfter  ? "not known (no snapshot after): "
                                          : "not known (snapshot not whole): ";
  return SummaryLine("unchanged: ", unchanged) + SummaryLine(reason, unknown);
}

}  // namespace

std::string DifferencesText(const Event& event, const ViewOptions& options) {
  const std::vector<ChangeGroup> groups = GroupChanges(event.Differences.List, options.ShowsAll);
  const size_t column = ColumnOfValues(groups);
  std::string text;
  for (const ChangeGroup& group : groups) {
    text += Painted(Printable(group.Title), Colour::kBold, options) + "\n";
    for (const ChangeLine& line : group.Lines) {
      text += LineOf(line, column, options);
    }
  }
  return text + SummaryOf(event);
}

std::string MessagesText(const Event& event) {
  std::string text;
  ForEachMessage(event,
                 [&text](std::string_view message) { text += "  " + Printable(message) + "\n"; });
  return text.empty() ? "" : "messages\n" + text;
}

std::string FilesText(const Event& event) {
  std::string text;
  for (const EventFile& file : event.Files) {
    text += "  " + Printable(file.Name) +
            (file.IsPresent ? "  " + std::to_string(file.Size) + " bytes"
                            : "  not in the history: " + Printable(file.Path)) +
            "\n";
  }
  return text.empty() ? "" : "files\n" + text;
}

// The parts that are not empty, with an empty line between them.
static std::string Joined(const std::vector<std::string>& parts) {
  std::string text;
  for (const std::string& part : parts) {
    if (!part.empty()) {
      text += (text.empty() ? "" : "\n") + part;
    }
  }
  return text;
}

static std::string HeadOf(const Event& event, const ViewOptions& options) {
  return Painted(Printable(TitleOf(event)), Colour::kBold, options) + "\n" +
         Printable(CourseOf(event)) + "\n";
}

std::string ChangesText(const Event& event, const ViewOptions& options) {
  return Joined({HeadOf(event, options), DifferencesText(event, options), MessagesText(event),
                 FilesText(event)});
}

std::string ShowText(const Event& event, const ViewOptions& options) {
  std::string facts;
  for (const Fact& fact : FactsOf(event)) {
    facts += "  " + PaddedTo(fact.Name, 15) + Printable(fact.Text) + "\n";
  }
  return Joined({HeadOf(event, options), facts, MessagesText(event), FilesText(event),
                 DifferencesText(event, options)});
}
