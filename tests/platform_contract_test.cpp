// What platform/*.h promises, tried against the implementation of this build. Where systems differ
// by contract, the case says so.

#include <gtest/gtest.h>

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <numeric>
#include <random>
#include <regex>
#include <set>
#include <sstream>
#include <string>

#include "platform/exclusive_file.h"
#include "platform/files.h"
#include "platform/folder_listing.h"
#include "platform/path.h"
#include "platform/profile_file.h"

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

const bool isWindows = kPathSeparator == '\\';
const std::string device = isWindows ? "NUL" : "/dev/null";

class Platform : public testing::Test {
 protected:
  void SetUp() override {
    Root = (fs::temp_directory_path() / ("orx-seam-" + std::to_string(std::random_device()())))
               .string();
    fs::create_directory(Root);
    Ini = In("a.ini");
  }
  void TearDown() override { fs::remove_all(Root); }

  // The path of a name with slashes.
  std::string In(std::string name) const {
    std::replace(name.begin(), name.end(), '/', kPathSeparator);
    return Root + kPathSeparator + name;
  }

  std::string Make(const std::string& name, const std::string& text) const {
    std::ofstream(In(name), std::ios::binary) << text;
    return In(name);
  }

  static std::string Text(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
  }

  // The names in a folder, sorted, each with a blank behind it.
  static std::string Names(const std::string& folder) {
    std::set<std::string> names;
    for (const FolderEntry& entry : ListFolder(folder)) {
      names.insert(entry.Name == "." || entry.Name == ".." ? "" : entry.Name + ' ');
    }
    return std::accumulate(names.begin(), names.end(), ""s);
  }

  // What is read of each value once it is written, with a bar behind it, as behind each value.
  std::string ReadEach(const std::string& values, const std::function<std::string()>& read) const {
    std::istringstream stream(values);
    std::string text;
    for (std::string value; std::getline(stream, value, '|');) {
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", value)) << value;
      text += read() + '|';
    }
    return text;
  }

  std::string Root;
  std::string Ini;
};

using Files = Platform;
using ProfileFile = Platform;

TEST_F(Files, HaveAKind) {
  const std::string file = Make("file", "");
  EXPECT_TRUE(CreateFolder(In("folder")));
  for (const std::string& path : {In("folder"), file, In("none/folder"), ""s}) {
    EXPECT_FALSE(CreateFolder(path)) << path;
    EXPECT_FALSE(IsSymbolicLink(path)) << path;
  }
  EXPECT_EQ(KindOf(file), FileKind::kFile);
  EXPECT_EQ(KindOf(In("folder")), FileKind::kFolder);
  for (const std::string& path : {In("none"), In("f*"), In("fil?"), In("file/x"), ""s}) {
    EXPECT_EQ(KindOf(path), FileKind::kNone) << path;
    EXPECT_FALSE(LastWriteTime(path).has_value()) << path;
    EXPECT_FALSE(FileAttributes(path).has_value()) << path;
  }
  EXPECT_NE(KindOf(device), FileKind::kFile);
  EXPECT_NE(KindOf(device), FileKind::kFolder);
}

TEST_F(Files, AreTheSameUnderAnySpelling) {
  const std::string file = Make("file", "x");
  Make("other", "x");
  fs::create_directory(In("folder"));
  fs::create_hard_link(file, In("link"));
  for (const std::string& same : {file, In("folder/../file"), In("link")}) {
    EXPECT_TRUE(IsSameFile(file, same)) << same;
  }
  EXPECT_EQ(IsSameFile(file, In("FILE")), isWindows);
  EXPECT_FALSE(IsSameFile(file, In("other")));
  EXPECT_FALSE(IsSameFile(file, In("none")));
  EXPECT_FALSE(IsSameFile(In("none"), In("none")));
}

TEST_F(Files, MovesAFolderToAFreeNameOnly) {
  fs::create_directories(fs::path(In("from")) / "sub");
  Make("from/sub/file", "text");
  fs::create_directory(In("empty"));
  Make("file", "");
  for (const std::string& target :
       {In("empty"), In("file"), In("from"), In("./from"), In("none/to")}) {
    EXPECT_FALSE(MoveFolder(In("from"), target)) << target;
    EXPECT_EQ(Text(In("from/sub/file")), "text");
  }
  EXPECT_FALSE(MoveFolder(In("none"), In("to")));
  EXPECT_FALSE(MoveFolder(In("file"), In("to")));
  EXPECT_TRUE(MoveFolder(In("from"), In("to")));
  EXPECT_EQ(Text(In("to/sub/file")), "text");
  EXPECT_EQ(Names(Root), "empty file to ");
}

TEST_F(Files, CopiesToANewFileOnly) {
  const std::string text(100000, 't');
  const std::string source = Make("source", text);
  fs::last_write_time(source, fs::last_write_time(source) - std::chrono::hours(1000));
  fs::permissions(source, fs::perms::owner_read);
  const std::string taken = Make("taken", "old");
  fs::create_directory(In("folder"));
  EXPECT_TRUE(CopyToNewFile(source, In("copy")));
  EXPECT_EQ(Text(In("copy")), text);
  EXPECT_EQ(fs::last_write_time(In("copy")), fs::last_write_time(source));
  for (const std::string& target : {taken, source, In("folder"), In("none/copy")}) {
    EXPECT_FALSE(CopyToNewFile(source, target)) << target;
  }
  EXPECT_FALSE(CopyToNewFile(In("none"), In("new")));
  EXPECT_FALSE(CopyToNewFile(In("folder"), In("new")));
  EXPECT_EQ(Text(taken), "old");
  EXPECT_EQ(Names(Root), "copy folder source taken ");
  fs::permissions(source, fs::perms::owner_all);  // Windows removes no file that is read-only
  fs::permissions(In("copy"), fs::perms::owner_all);
}

TEST_F(Files, AreListedWithTheirProperties) {
  Make("plain", "");
  fs::permissions(Make("fixed", ""), fs::perms::owner_read);
  Make(".dot", "");
  fs::create_directory(In("folder"));
  constexpr uint32_t readOnly = 1;
  for (const auto& [name, attributes] : ListFolder(Root)) {
    EXPECT_EQ(attributes, FileAttributes(In(name))) << name;
    const bool isFolder = name == "folder" || name == "." || name == "..";
    EXPECT_EQ((attributes & kFolderAttribute) != 0, isFolder) << name;
    EXPECT_EQ((attributes & readOnly) != 0, name == "fixed") << name;
  }
  EXPECT_EQ(Names(Root), ".dot fixed folder plain ");
  EXPECT_EQ(Names(In("folder")), "");
  EXPECT_TRUE(ListFolder(In("none")).empty());
  EXPECT_TRUE(ListFolder(In("plain")).empty());
  fs::permissions(In("fixed"), fs::perms::owner_all);
}

TEST_F(Files, KeepTheTimeOfTheirLastWrite) {
  const std::time_t before = std::time(nullptr);
  Make("file", "x");
  fs::create_directory(In("folder"));
  for (const char* name : {"file", "folder"}) {
    const CalendarTime time = LastWriteTime(In(name)).value();
    tm fields = {};
    fields.tm_year = time.Year - 1900;
    fields.tm_mon = time.Month - 1;
    fields.tm_mday = time.Day;
    fields.tm_hour = time.Hour;
    fields.tm_min = time.Minute;
    fields.tm_sec = time.Second;
    fields.tm_isdst = -1;
    EXPECT_NEAR(std::difftime(std::mktime(&fields), before), 0, 5);
  }
}

TEST_F(Files, AreReadExclusively) {
  const std::string bytes = "line\r\n\x1A\0"s + std::string(5000, 'b');
  const std::string path = Make("file", bytes);
  {
    ExclusiveFile file(path);
    char buffer[6000];
    const size_t first = file.Read(buffer, 9);
    const size_t rest = file.Read(buffer + first, sizeof buffer - first);
    EXPECT_EQ(std::string(buffer, first + rest), bytes);
    EXPECT_EQ(ExclusiveFile(path).IsOpen(), !isWindows);
  }
  EXPECT_TRUE(ExclusiveFile(path).IsOpen());
  for (const std::string& other : {Root, In("none"), device}) {
    ExclusiveFile file(other);
    char byte = 0;
    EXPECT_FALSE(file.IsOpen()) << other;
    EXPECT_EQ(file.Read(&byte, 1), 0U) << other;
  }
}

TEST(Path, IsMadeAbsolute) {
  const std::string here = fs::current_path().string();
  EXPECT_TRUE(IsRootedPath(here));
  EXPECT_FALSE(IsRootedPath("a"));
  EXPECT_EQ(AbsolutePath("a"), here + kPathSeparator + "a");
  EXPECT_EQ(AbsolutePath(""), std::nullopt);
  // The longest path that a buffer of 260 bytes holds; POSIX has no such limit.
  const std::string root = isWindows ? "C:\\" : "/";
  const std::string longest = root + std::string(259 - root.size(), 'x');
  EXPECT_EQ(AbsolutePath(longest), longest);
  EXPECT_EQ(AbsolutePath(longest + 'x').has_value(), !isWindows);
}

TEST_F(ProfileFile, CutsValuesAtTheBuffersEnd) {
  EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "0123456789"));
  for (const uint32_t size : {1U, 2U, 10U, 11U, 12U, 256U}) {
    const std::string expected = "0123456789"s.substr(0, size - 1);
    EXPECT_EQ(ReadProfileValue(Ini, "S", "Key", "", size), expected) << size;
    EXPECT_EQ(ReadProfileValue(Ini, "S", "None", "0123456789", size), expected) << size;
    EXPECT_EQ(ReadProfileValue(In("none"), "S", "Key", "0123456789", size), expected) << size;
  }
  EXPECT_EQ(Names(Root), "a.ini ");
}

TEST_F(ProfileFile, TakesBlanksAndOnePairOfQuotesOffAValue) {
  const auto readText = [this] { return ReadProfileValue(Ini, "S", "Key", "none", 256); };
  EXPECT_EQ(ReadEach(R"("a"|'a'|""a""|" a "|"a|a"|"a'|"a" "b"|"|""|  a b  | "a" |a=b;c|[x]||  |)",
                     readText),
            R"(a|a|"a"| a |"a|a"|"a'|a" "b|"||a b|a|a=b;c|[x]|||)");
  const auto readNumber = [this] { return std::to_string(ReadProfileInt(Ini, "S", "Key", 5)); };
  EXPECT_EQ(ReadEach(R"(12|-12|0|12abc|abc|-| 7 |007|"12"|2147483647|)", readNumber),
            "12|-12|0|12|0|0|7|7|12|2147483647|");
  EXPECT_EQ(ReadProfileInt(Ini, "S", "None", -5), -5);
  EXPECT_EQ(ReadProfileInt(In("none"), "S", "Key", 5), 5);
}

TEST_F(ProfileFile, KeepsOrderAndCase) {
  const char* const writes[][3] = {{"One", "B", "1"}, {"Two", "K", "2"},  {"One", "A", "3"},
                                   {"ONE", "b", "4"}, {"two", "New", ""}, {"Two", "K", ""}};
  for (const auto& [section, key, value] : writes) {
    EXPECT_TRUE(WriteProfileValue(Ini, section, key, value));
  }
  // Line ends are the system's, which may also set a blank line between sections.
  const std::string text = std::regex_replace(Text(Ini), std::regex("[\r\n]+"), "\n");
  EXPECT_EQ(text, "[One]\nB=4\nA=3\n[Two]\nK=\nNew=\n");
  EXPECT_EQ(ReadProfileValue(Ini, "TWO", "new", "none", 256), "");
  EXPECT_EQ(ReadProfileValue(Ini, "oNE", "a", "none", 256), "3");
}

TEST_F(ProfileFile, ListsSectionsAsFarAsTheyFit) {
  const auto upToEnd = [](const std::string& names) {
    return names.substr(0, names.find("\0\0"s));
  };
  EXPECT_EQ(ReadProfileSectionNames(Ini, 100).substr(0, 2), "\0\0"s);
  WriteProfileValue(Ini, "ab", "Key", "");
  WriteProfileValue(Ini, "cde", "Key", "");
  for (const uint32_t size : {2, 3, 5, 6, 7, 8, 9, 100}) {
    const std::string names = ReadProfileSectionNames(Ini, size);
    EXPECT_LE(names.size(), size);
    EXPECT_EQ(upToEnd(names), upToEnd("ab\0cde"s.substr(0, size - 2) + "\0\0"s)) << size;
  }
}

TEST_F(ProfileFile, IsNotMadeWhereItCannotBe) {
  fs::create_directory(In("folder"));
  EXPECT_FALSE(WriteProfileValue(In("folder"), "S", "Key", "v"));
  EXPECT_FALSE(WriteProfileValue(In("none/a.ini"), "S", "Key", "v"));
  EXPECT_EQ(ReadProfileValue(In("folder"), "S", "Key", "none", 256), "none");
  EXPECT_EQ(Names(Root), "folder ");
}

TEST_F(ProfileFile, ChangesAtOnceWhenTheOutermostGuardEnds) {
  WriteProfileValue(Ini, "S", "Key", "old");
  const std::string before = Text(Ini);
  {
    const ProfileGuard guard(Ini);
    {
      const ProfileGuard inner(Ini);
      EXPECT_TRUE(WriteProfileValue(Ini, "S", "Key", "new"));
      EXPECT_TRUE(WriteProfileValue(Ini, "T", "Key", "more"));
    }
    EXPECT_EQ(ReadProfileValue(Ini, "S", "Key", "", 256), "new");
    EXPECT_EQ(ReadProfileValue(Ini, "T", "Key", "", 256), "more");
    EXPECT_EQ(Text(Ini), before);
  }
  EXPECT_EQ(ReadProfileValue(Ini, "S", "Key", "", 256), "new");
  EXPECT_NE(Text(Ini), before);
  EXPECT_EQ(Names(Root), "a.ini ");
}

}  // namespace
