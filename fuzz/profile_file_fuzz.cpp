#include <cstdint>
#include <cstdlib>
#include <string>
#include <string_view>
#include <vector>

#include "platform/posix/profile_text.h"

// Any bytes as a profile file, into which keys are then written: what was written reads back, what
// else the file holds stays, and the places kept through the changes are those of a fresh reading.

namespace {

void Require(bool condition) {
  if (!condition) {
    std::abort();
  }
}

void WriteAndCheck(ProfileText& text, std::string_view section, std::string_view key,
                   std::string_view value) {
  text.Set(section, key, value);
  Require(text.Find(section, key) == TrimBlanks(value));
  const ProfileText again(text.Get());
  Require(again.SectionNames() == text.SectionNames());
  Require(again.Find(section, key) == text.Find(section, key));
  // A second time, nothing is there to be changed.
  const std::string once = text.Get();
  text.Set(section, key, value);
  Require(text.Get() == once);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  ProfileText text(std::string(data, data + size));
  const std::vector<std::string_view> found = text.SectionNames();
  const std::vector<std::string> names(found.begin(), found.end());
  for (const std::string& name : names) {
    text.Find(name, "Count");
  }
  WriteAndCheck(text, "History", "Count", "1");
  WriteAndCheck(text, "42", "Result", " blanks around ");
  WriteAndCheck(text, "History", "Count", "");
  for (const std::string& name : names) {
    if (name.find('\r') == std::string::npos) {  // no caller has a line break in a name
      WriteAndCheck(text, name, "Count", "2");
    }
  }
  return 0;
}
