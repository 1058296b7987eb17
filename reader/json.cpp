#include "reader/json.h"

#include <nlohmann/json.hpp>
#include <utility>

namespace {

using Json = nlohmann::ordered_json;

// JSON may have the characters U+007F to U+009F as they are, but a terminal could obey them.
std::string WithoutControls(std::string json) {
  if (json.find_first_of("\x7F\xC2") == std::string::npos) {
    return json;
  }
  constexpr char digits[] = "0123456789abcdef";
  std::string result;
  result.reserve(json.size());
  for (size_t i = 0; i < json.size(); ++i) {
    const bool isPair = json[i] == '\xC2' && (json[i + 1] & 0xE0) == 0x80;
    i += isPair ? 1 : 0;
    if (isPair || json[i] == '\x7F') {
      const auto byte = static_cast<unsigned char>(json[i]);
      result.append("\\u00") += {digits[byte >> 4], digits[byte & 0xF]};
    } else {
      result += json[i];
    }
  }
  return result;
}

std::string Line(const Json& object) {
  return WithoutControls(
      object.dump(/*indent=*/-1, ' ', /*ensure_ascii=*/false, Json::error_handler_t::replace));
}

template <typename T>
Json OrNull(const std::optional<T>& value) {
  return value ? Json(*value) : Json();
}

Json TimeOrNull(const std::optional<LocalTime>& time) {
  return time ? Json(IsoTime(*time)) : Json();
}

Json Facts(const Event& event) {
  return {{"event", event.Identity},
          {"computer", OrNull(event.Computer)},
          {"started", TimeOrNull(event.Started)},
          {"ended", TimeOrNull(event.Ended)},
          {"state", StateName(event.State)},
          {"action", event.Action},
          {"type", event.Type},
          {"product", event.Product},
          {"version", event.Version},
          {"service_level", event.ServiceLevel},
          {"path", event.Path},
          {"copy", event.Copy},
          {"result", event.Result}};
}

Json Fields(const Change& change) {
  Json fields = Json::object();
  for (const FieldChange& field : change.Fields) {
    fields[std::string(field.Name)] = {{"before", OrNull(field.Before)},
                                       {"after", OrNull(field.After)}};
  }
  return fields;
}

void AddChange(Json& object, const Change& change) {
  object["change"] = ChangeName(change.Kind);
  object["section"] = SectionName(change.Where);
  object["path"] = change.Path;
  object["name"] = change.Name;
  object["fields"] = Fields(change);
}

Json FilesOf(const Event& event) {
  Json files = Json::array();
  for (const EventFile& file : event.Files) {
    files.push_back({{"key", file.Key},
                     {"path", file.Path},
                     {"present", file.IsPresent},
                     {"size", file.IsPresent ? Json(file.Size) : Json()}});
  }
  return files;
}

// The elements of an array, each made into text at once: a JSON value takes several times the
// memory of a short message.
std::string MessageElements(const Event& event) {
  std::string elements;
  ForEachMessage(event, [&elements](std::string_view message) {
    elements += (elements.empty() ? "" : ",") + Line(message);
  });
  return elements;
}

std::string ChangeElements(const Event& event) {
  std::string elements;
  for (const Change& change : event.Differences.List) {
    Json object = Json::object();
    AddChange(object, change);
    elements += (elements.empty() ? "" : ",") + Line(object);
  }
  return elements;
}

// The sections of which nothing can be said.
Json NotCompared(const Event& event) {
  Json sections = Json::array();
  for (size_t i = 0; i < kSectionCount; ++i) {
    if (!event.Differences.Compared[i]) {
      sections.push_back(SectionName(static_cast<Section>(i)));
    }
  }
  return sections;
}

}  // namespace

std::string EventJson(std::string_view source, const Event& event) {
  const ChangeCounts& counts = event.Differences.Counts;
  Json object = Facts(event);
  object["changes"] = {
      {"added", counts.Added}, {"removed", counts.Removed}, {"changed", counts.Changed}};
  object["source"] = source;
  return Line(object);
}

std::string EventDetailsJson(std::string_view source, const Event& event) {
  Json object = Facts(event);
  object["command_line"] = event.CommandLine;
  object["report"] = OrNull(event.Report);
  object["files"] = FilesOf(event);
  const Json end = {{"not_compared", NotCompared(event)}, {"source", source}};
  std::string line = Line(object);
  line.pop_back();
  line += ",\"messages\":[" + MessageElements(event) + "],\"changes\":[" + ChangeElements(event) +
          "]," + Line(end).substr(1);
  return line;
}

std::string ChangeJson(std::string_view source, const Event& event, const Change& change) {
  Json object = {{"event", event.Identity}};
  AddChange(object, change);
  object["source"] = source;
  return Line(object);
}

std::string FindingJson(std::string_view source, const Finding& finding) {
  return Line({{"level", LevelName(finding.Level)},
               {"code", finding.Code},
               {"event", finding.Event},
               {"text", finding.Text},
               {"source", source}});
}

std::string HitJson(std::string_view source, const Event& event, std::string_view kind,
                    std::string_view name, std::string_view text) {
  return Line({{"event", event.Identity},
               {"started", TimeOrNull(event.Started)},
               {"kind", kind},
               {"name", name},
               {"text", text},
               {"source", source}});
}
