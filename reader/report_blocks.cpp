#include "reader/report_blocks.h"

#include <string>
#include <utility>

#include "reader/report_marks.h"

// The value after a label, with further lines up to the one that begins with the next label: a
// value from the command line may have line breaks in it. Nothing at the start of another block.
static std::optional<std::string_view> ValueUpTo(LineReader& lines, std::string_view label,
                                                 std::string_view nextLabel) {
  const auto first = lines.Labelled(label);
  if (!first) {
    return std::nullopt;
  }
  std::string_view value = *first;
  while (!lines.Remaining().starts_with(nextLabel)) {
    const auto line = lines.Next();
    if (!line || line->starts_with(kStartTitle) || line->starts_with("**********")) {
      return std::nullopt;
    }
    value = {value.data(), static_cast<size_t>(line->data() + line->size() - value.data())};
  }
  return value;
}

std::optional<StartBlock> ReadStart(LineReader& lines) {
  const auto time = lines.Labelled(kStartTitle);
  const auto identity = ValueUpTo(lines, "EventID       :", "Product       :");
  const auto product = ValueUpTo(lines, "Product       :", "Service Level :");
  const auto serviceLevel = ValueUpTo(lines, "Service Level :", "CommandLine   :");
  LineReader ahead = lines;
  auto commandLine = ValueUpTo(ahead, "CommandLine   :", "\nSystem Information: \n");
  if (commandLine) {
    lines = ahead;
  } else {
    commandLine = lines.Labelled("CommandLine   :");  // the run broke off after it
  }
  if (!time || !identity || !product || !serviceLevel || !commandLine) {
    return std::nullopt;
  }
  return StartBlock{*time, *identity, *product, *serviceLevel, *commandLine};
}

std::optional<std::string_view> ReadComputer(LineReader& lines) {
  const std::string rule(45, '=');
  if (!lines.SkipAll({"", "System Information: ", rule})) {
    return std::nullopt;
  }
  const auto name = lines.Labelled("Computer Name       :");
  for (const std::string_view label :
       {"OS                  :", "Type                :", "Service Pack        :",
        "Number of processors:", "CPU                 :"}) {
    if (!lines.Labelled(label)) {
      return std::nullopt;
    }
  }
  return lines.SkipAll({rule, ""}) ? name : std::nullopt;
}

static bool ReadEndLines(LineReader& lines, ResultBlock& result) {
  const std::string rule(69, '=');
  if (!lines.SkipAll({"", "", "", ""}) || !lines.Labelled("Result of ") || !lines.Skip(rule)) {
    return false;
  }
  for (const auto& [label, field] :
       {std::pair("Start Time                   :", &ResultBlock::StartTime),
        std::pair("End   Time                   :", &ResultBlock::EndTime),
        std::pair("ORX Products & Build Level   :", &ResultBlock::Product),
        std::pair("Service Level                :", &ResultBlock::ServiceLevel),
        std::pair("Install Type ( GUI | Silent ):", &ResultBlock::Type),
        std::pair("Installation Action          :", &ResultBlock::Action),
        std::pair("Result                       :", &ResultBlock::Result),
        std::pair("Log File Name                :", &ResultBlock::LogFile),
        std::pair("Trace File Name              :", &ResultBlock::TraceFile)}) {
    const auto value = lines.Labelled(label);
    if (!value) {
      return false;
    }
    result.*field = *value;
  }
  return lines.SkipAll({rule, "", ""}) && lines.Labelled(kEndTitle);
}

EndBlocks ReadEnd(std::string_view text, size_t offset) {
  EndBlocks blocks;
  LineReader lines(text.substr(offset));
  if (!ReadEndLines(lines, blocks.Result)) {
    const bool hasLine = lines.Remaining().find('\n') != std::string_view::npos;
    blocks.Status = hasLine ? EndStatus::kContradicts : EndStatus::kBreaksOff;
  }
  blocks.End = text.size() - lines.Remaining().size();
  return blocks;
}
