#include "reader/event_text.h"

namespace {

void AddFact(std::vector<Fact>& facts, std::string_view name, const std::string& text) {
  if (!text.empty()) {
    facts.push_back({name, text});
  }
}

std::string TextIfKnown(const std::optional<LocalTime>& time) {
  return time ? TextOfTime(*time) : "";
}

// A number of two digits.
std::string TwoDigits(int64_t number) {
  const std::string text = std::to_string(number);
  return text.size() < 2 ? "0" + text : text;
}

// The end, without its date if that is the one of the start.
std::string EndAfter(LocalTime start, LocalTime end) {
  const std::string text = TextOfTime(end);
  constexpr size_t date = 10;
  return TextOfTime(start).substr(0, date) == text.substr(0, date) ? text.substr(date + 1) : text;
}

// A field whose name says nothing that its section does not.
bool IsPlainField(std::string_view name) {
  return name == "value" || name == "state" || name == "count";
}

std::string Shown(const std::optional<std::string>& value) {
  return value.value_or("").empty() ? "(empty)" : *value;
}

}  // namespace

std::string TextOfTime(LocalTime time) {
  std::string text = IsoTime(time);
  text[text.find('T')] = ' ';
  return text;
}

std::string DurationOf(const Event& event) {
  if (!event.Started || !event.Ended || *event.Ended < *event.Started) {
    return "";
  }
  const int64_t seconds = *event.Ended - *event.Started;
  if (seconds < 60) {
    return std::to_string(seconds) + " s";
  }
  const int64_t minutes = (seconds + 30) / 60;
  if (minutes < 60) {
    return std::to_string(minutes) + " min";
  }
  const int64_t hours = minutes / 60;
  if (hours < 24) {
    return std::to_string(hours) + " h " + TwoDigits(minutes % 60) + " min";
  }
  return std::to_string(hours / 24) + " d " + TwoDigits(hours % 24) + " h";
}

std::vector<Fact> FactsOf(const Event& event) {
  std::vector<Fact> facts;
  AddFact(facts, "event", event.Identity);
  AddFact(facts, "computer", event.Computer.value_or(""));
  AddFact(facts, "started", TextIfKnown(event.Started));
  AddFact(facts, "ended", TextIfKnown(event.Ended));
  AddFact(facts, "state", std::string(StateName(event.State)));
  AddFact(facts, "action", event.Action);
  AddFact(facts, "type", event.Type);
  AddFact(facts, "product", event.Product);
  AddFact(facts, "version", event.Version);
  AddFact(facts, "service level", event.ServiceLevel);
  AddFact(facts, "path", event.Path);
  AddFact(facts, "copy", event.Copy);
  AddFact(facts, "result", event.Result);
  AddFact(facts, "command line", event.CommandLine);
  AddFact(facts, "report", event.Report.value_or(""));
  return facts;
}

std::string TitleOf(const Event& event) {
  std::string title = "Event " + event.Identity;
  std::string_view separator = ": ";
  const auto add = [&](const std::string& text) {
    if (!text.empty()) {
      title.append(separator).append(text);
      separator = ", ";
    }
  };
  add(event.Action);
  add(event.Product);
  add(event.Copy.empty() || event.Copy == "(Unknown)" ? "" : "copy " + event.Copy);
  add(event.Origin == EventOrigin::kEarlierRun ? "an earlier run"
      : event.Origin == EventOrigin::kOrphan   ? "known from its report alone"
                                               : "");
  return title;
}

std::string CourseOf(const Event& event) {
  std::string course = event.Started ? TextOfTime(*event.Started) : "";
  if (event.Started && event.Ended) {
    course += " to " + EndAfter(*event.Started, *event.Ended);
  } else if (event.Ended) {
    course = "until " + TextOfTime(*event.Ended);
  }
  if (const std::string duration = DurationOf(event); !duration.empty()) {
    course += " (" + duration + ")";
  }
  course += (course.empty() ? "" : ", ") + std::string(StateName(event.State));
  return event.Result.empty() ? course : course + ": " + event.Result;
}

std::string TextOfFields(const Change& change) {
  std::string text;
  for (const FieldChange& field : change.Fields) {
    const std::string name = IsPlainField(field.Name) ? "" : std::string(field.Name) + " ";
    const std::string value = change.Kind == ChangeKind::kChanged
                                  ? Shown(field.Before) + " -> " + Shown(field.After)
                              : field.After ? *field.After
                                            : field.Before.value_or("");
    if (change.Kind == ChangeKind::kChanged || !value.empty()) {
      text.append(text.empty() ? "" : ", ").append(name).append(value);
    }
  }
  return text;
}

std::string TextOfChange(const Change& change) {
  std::string text(SectionName(change.Where));
  for (const std::string& part : change.Path) {
    text += ", " + part;
  }
  text += ": " + change.Name;
  if (change.Kind != ChangeKind::kChanged) {
    text += " " + std::string(ChangeName(change.Kind));
  }
  const std::string fields = TextOfFields(change);
  return fields.empty() ? text : text + " " + fields;
}
