#include "fuzz/profile_model.h"
#include "platform/profile_text.h"

// The first line of the input is a program, the rest is a profile file. Three characters of the
// program are a change: a section, a key and a value, as indices of the tables below; the file's
// own sections are added to the table of sections.

namespace {

using Words = std::vector<std::string>;

struct Change {
  std::string Section;
  std::string Key;
  std::string Value;
};

const std::string& Choose(const Words& words, char index) {
  return words[static_cast<uint8_t>(index - '0') % words.size()];
}

std::vector<Change> ReadProgram(std::string_view program, const ProfileModel& file) {
  const Words keys = {"Count", "RESULT", " count\t", "a[b]", "", "]"};
  const Words values = {"1", "", " blanks around ", "\"quoted\"", "a=b", "[History]"};
  Words sections = {"History", " 42", "history", "", "]", "[", "\xEF\xBB\xBF[x"};
  constexpr size_t mostChanges = 8;
  for (const std::string_view name : file.SectionNames()) {
    sections.emplace_back(name);
  }
  std::vector<Change> changes;
  for (size_t i = 0; i + 2 < program.size() && changes.size() < mostChanges; i += 3) {
    changes.push_back({Choose(sections, program[i]), Choose(keys, program[i + 1]),
                       Choose(values, program[i + 2])});
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

void CheckInput(const std::string& input) {
  const std::string program = input.substr(0, input.find('\n'));
  const std::string file = input.substr(std::min(program.size() + 1, input.size()));
  ProfileModel model(file);
  ProfileText text(file);
  const std::vector<Change> changes = ReadProgram(program, model);
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
}
