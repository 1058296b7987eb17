#include <cstdint>
#include <iterator>
#include <string>
#include <string_view>
#include <vector>

#include "fuzz/profile_model.h"
#include "fuzz/support.h"
#include "platform/profile_text.h"

// The first line of the input is a program, the rest is a profile file. Three characters of the
// program are a change: a section, a key and a value, as indices of the tables below; the file's
// own sections are added to the table of sections. Before and after each change ProfileText equals
// the model byte for byte and reads as the model does.

namespace {

struct Change {
  std::string Section;
  std::string Key;
  std::string Value;
};

size_t NumberOf(char character, size_t count) {
  return static_cast<uint8_t>(character - '0') % count;
}

std::vector<Change> ReadProgram(std::string_view program, const ProfileModel& file) {
  constexpr const char* keys[] = {"Count", "RESULT", " count\t", "a[b]", "", "]"};
  constexpr const char* values[] = {"1", "", " blanks around ", "\"quoted\"", "a=b", "[History]"};
  constexpr size_t mostChanges = 8;
  std::vector<std::string> sections = {"History", " 42", "history", "", "]", "[", "\xEF\xBB\xBF[x"};
  for (const std::string_view name : file.SectionNames()) {
    sections.emplace_back(name);
  }
  std::vector<Change> changes;
  for (size_t i = 0; i + 2 < program.size() && changes.size() < mostChanges; i += 3) {
    changes.push_back({sections[NumberOf(program[i], sections.size())],
                       keys[NumberOf(program[i + 1], std::size(keys))],
                       values[NumberOf(program[i + 2], std::size(values))]});
  }
  return changes;
}

void CompareAnswers(const ProfileText& text, const ProfileModel& model,
                    const std::vector<Change>& changes) {
  Require(text.SectionNames() == model.SectionNames());
  for (const Change& change : changes) {
    Require(text.Find(change.Section, change.Key) == model.Find(change.Section, change.Key));
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  const std::string input(data, data + size);
  const size_t programEnd = std::min(input.find('\n'), size);
  const std::string file = input.substr(std::min(programEnd + 1, size));
  ProfileModel model(file);
  ProfileText text(file);
  const std::vector<Change> changes = ReadProgram(input.substr(0, programEnd), model);
  CompareAnswers(text, model, changes);
  for (const Change& change : changes) {
    text.Set(change.Section, change.Key, change.Value);
    model.Set(change.Section, change.Key, change.Value);
    Require(text.Get() == model.Text());
    Require(text.Find(change.Section, change.Key) == ProfileModel::ValueOf(change.Value));
  }
  CompareAnswers(text, model, changes);
  // The offsets that were kept through the changes are those of a new ProfileText.
  CompareAnswers(ProfileText(text.Get()), model, changes);
  return 0;
}
