// What platform/*.h promises, tried against the implementation of this build. Where systems differ
// by contract, the case says so.

#include <gtest/gtest.h>

#include <algorithm>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <random>
#include <string>
#include <vector>

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
  }
  void TearDown() override { fs::remove_all(Root); }

  std::string In(const std::string& name) const { return Root + kPathSeparator + name; }

  std::string Make(const std::string& name, const std::string& text) const {
    std::ofstream(In(name), std::ios::binary) << text;
    return In(name);
  }

  // All bytes but the carriage returns, which stand before the line feeds on Windows alone.
  static std::string Text(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    std::string text{std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
    std::erase(text, '\r');
    return text;
  }

  static std::vector<std::string> Names(const std::string& folder) {
    std::vector<std::string> names;
    for (const FolderEntry& entry : ListFolder(folder)) {
      if (entry.Name != "." && entry.Name != "..") {
        names.push_back(entry.Name);
      }
    }
    std::sort(names.begin(), names.end());
    return names;
  }

  std::string Root;
};

using Files = Platform;
using ProfileFile = Platform;

TEST_F(Files, HaveAKind) {
  Make("file", "");
  fs::create_directory(In("folder"));
  const std::pair<std::string, FileKind> cases[] = {
      {In("file"), FileKind::kFile},
      {In("folder"), FileKind::kFolder},
      {In("none"), {}},
      {In("f*"), FileKind::kNone},
      {In("fil?"), FileKind::kNone},
      {"", FileKind::kNone},
      {In("file") + kPathSeparator + "x", FileKind::kNone},
  };
  for (const auto& [path, kind] : cases) {
    EXPECT_EQ(KindOf(path), kind) << path;
    EXPECT_FALSE(IsSymbolicLink(path)) << path;
  }
  EXPECT_NE(KindOf(device), FileKind::kFile);
  EXPECT_NE(KindOf(device), FileKind::kFolder);
}

TEST_F(Files, AreTheSameUnderAnySpelling) {
  const std::string file = Make("file", "x");
  Make("other", "x");
  fs::create_directory(In("folder"));
  fs::create_hard_link(file, In("link"));
  const std::string indirect = In("folder") + kPathSeparator + ".." + kPathSeparator + "file";
  EXPECT_TRUE(IsSameFile(file, file));
  EXPECT_TRUE(IsSameFile(file, indirect));
  EXPECT_TRUE(IsSameFile(In("link"), file));
  EXPECT_EQ(IsSameFile(file, In("FILE")), isWindows);
  EXPECT_FALSE(IsSameFile(file, In("other")));
  EXPECT_FALSE(IsSameFile(file, In("none")));
  EXPECT_FALSE(IsSameFile(In("none"), In("none")));
}

TEST_F(Files, FoldersAreMadeOnceAndOneAtATime) {
  EXPECT_TRUE(CreateFolder(In("new")));
  EXPECT_EQ(KindOf(In("new")), FileKind::kFolder);
  EXPECT_FALSE(CreateFolder(In("new")));
  EXPECT_FALSE(CreateFolder(Make("file", "")));
  EXPECT_FALSE(CreateFolder(In("none") + kPathSeparator + "new"));
  EXPECT_FALSE(CreateFolder(""));
}

TEST_F(Files, MovesAFolderToAFreeNameOnly) {
  fs::create_directories(fs::path(In("from")) / "sub");
  Make("from/sub/file", "text");
  fs::create_directory(In("empty"));
  Make("file", "");
  const std::string targets[] = {In("empty"), In("file"), In("from"),
                                 Root + kPathSeparator + "." + kPathSeparator + "from",
                                 In("none") + kPathSeparator + "to"};
  for (const std::string& target : targets) {
    EXPECT_FALSE(MoveFolder(In("from"), target)) << target;
    EXPECT_EQ(Text(In("from/sub/file")), "text");
  }
  EXPECT_FALSE(MoveFolder(In("none"), In("to")));
  EXPECT_FALSE(MoveFolder(In("file"), In("to")));
  EXPECT_TRUE(MoveFolder(In("from"), In("to")));
  EXPECT_EQ(Text(In("to/sub/file")), "text");
  EXPECT_EQ(Names(Root), (std::vector<std::string>{"empty", "file", "to"}));
}

TEST_F(Files, CopiesToANewFileOnly) {
  const std::string text(100000, 't');
  const std::string source = Make("source", text);
  fs::last_write_time(source, fs::last_write_time(source) - std::chrono::hours(1000));
  fs::permissions(source, fs::perms::owner_read);
  Make("taken", "old");
  fs::create_directory(In("folder"));
  EXPECT_TRUE(CopyToNewFile(source, In("copy")));
  EXPECT_EQ(Text(In("copy")), text);
  EXPECT_EQ(fs::last_write_time(In("copy")), fs::last_write_time(source));
  EXPECT_FALSE(CopyToNewFile(source, In("taken")));
  EXPECT_EQ(Text(In("taken")), "old");
  EXPECT_FALSE(CopyToNewFile(source, source));
  EXPECT_FALSE(CopyToNewFile(source, In("folder")));
  EXPECT_FALSE(CopyToNewFile(source, In("none") + kPathSeparator + "copy"));
  EXPECT_FALSE(CopyToNewFile(In("none"), In("new")));
  EXPECT_FALSE(CopyToNewFile(In("folder"), In("new")));
  EXPECT_EQ(Names(Root), (std::vector<std::string>{"copy", "folder", "source", "taken"}));
  fs::permissions(source, fs::perms::owner_all);  // Windows removes no file that is read-only
  fs::permissions(In("copy"), fs::perms::owner_all);
}

TEST_F(Files, AreListedWithTheirProperties) {
  Make("plain", "");
  fs::permissions(Make("fixed", ""), fs::perms::owner_read);
  Make(".dot", "");
  fs::create_directory(In("folder"));
  constexpr uint32_t readOnly = 1;
  for (const FolderEntry& entry : ListFolder(Root)) {
    EXPECT_EQ(entry.Attributes, FileAttributes(In(entry.Name))) << entry.Name;
    const bool isFolder = entry.Name == "folder" || entry.Name == "." || entry.Name == "..";
    EXPECT_EQ((entry.Attributes & kFolderAttribute) != 0, isFolder) << entry.Name;
    EXPECT_EQ((entry.Attributes & readOnly) != 0, entry.Name == "fixed") << entry.Name;
  }
  EXPECT_EQ(Names(Root), (std::vector<std::string>{".dot", "fixed", "folder", "plain"}));
  EXPECT_TRUE(Names(In("folder")).empty());
  EXPECT_TRUE(ListFolder(In("none")).empty());
  EXPECT_TRUE(ListFolder(In("plain")).empty());
  EXPECT_EQ(FileAttributes(In("none")), std::nullopt);
  fs::permissions(In("fixed"), fs::perms::owner_all);
}

TEST_F(Files, KeepTheTimeOfTheirLastWrite) {
  const std::time_t before = std::time(nullptr);
  Make("file", "x");
  fs::create_directory(In("folder"));
  for (const char* name : {"file", "folder"}) {
    const std::optional<CalendarTime> time = LastWriteTime(In(name));
    ASSERT_TRUE(time.has_value());
    tm fields = {};
    fields.tm_year = time->Year - 1900;
    fields.tm_mon = time->Month - 1;
    fields.tm_mday = time->Day;
    fields.tm_hour = time->Hour;
    fields.tm_min = time->Minute;
    fields.tm_sec = time->Second;
    fields.tm_isdst = -1;
    EXPECT_NEAR(std::difftime(std::mktime(&fields), before), 0, 5);
  }
  EXPECT_FALSE(LastWriteTime(In("none")).has_value());
  EXPECT_FALSE(LastWriteTime(In("f*")).has_value());
}

TEST_F(Files, AreReadExclusively) {
  std::string bytes(5000, 'b');
  bytes[7] = '\r';
  bytes[8] = '\n';
  bytes[9] = '\x1A';
  bytes[10] = '\0';
  const std::string path = Make("file", bytes);
  {
    ExclusiveFile file(path);
    ASSERT_TRUE(file.IsOpen());
    std::string read;
    char buffer[2048];
    for (size_t count; (count = file.Read(buffer, sizeof buffer)) > 0;) {
      read.append(buffer, count);
    }
    EXPECT_EQ(read, bytes);
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
  EXPECT_EQ(AbsolutePath(here), here);
  EXPECT_EQ(AbsolutePath(""), std::nullopt);
  // The longest path that a buffer of 260 bytes holds; POSIX has no such limit.
  const std::string root = isWindows ? "C:\\" : "/";
  const std::string longest = root + std::string(259 - root.size(), 'x');
  EXPECT_EQ(AbsolutePath(longest), longest);
  EXPECT_EQ(AbsolutePath(longest + 'x').has_value(), !isWindows);
}

TEST_F(ProfileFile, CutsValuesAtTheBuffersEnd) {
  const std::string path = In("a.ini");
  ASSERT_TRUE(WriteProfileString(path, "S", "Key", "0123456789"));
  for (const uint32_t size : {1U, 2U, 10U, 11U, 12U, 256U}) {
    const std::string expected = "0123456789"s.substr(0, size - 1);
    EXPECT_EQ(ReadProfileString(path, "S", "Key", "", size), expected) << size;
    EXPECT_EQ(ReadProfileString(path, "S", "None", "0123456789", size), expected) << size;
    EXPECT_EQ(ReadProfileString(In("none.ini"), "S", "Key", "0123456789", size), expected);
  }
  EXPECT_FALSE(fs::exists(In("none.ini")));
}

TEST_F(ProfileFile, TakesBlanksAndOnePairOfQuotesOffAValue) {
  const char* cases[][2] = {
      {"\"a\"", "a"},
      {"'a'", "a"},
      {"\"\"a\"\"", "\"a\""},
      {"\" a \"", " a "},
      {"\"a", "\"a"},
      {"a\"", "a\""},
      {"\"a'", "\"a'"},
      {"a \"b\" c", "a \"b\" c"},
      {"\"", "\""},
      {"\"\"", ""},
      {"  a b  ", "a b"},
      {" \"a\" ", "a"},
      {"a=b;c", "a=b;c"},
      {"[x]", "[x]"},
      {"", ""},
      {"  ", ""},
  };
  for (const auto& [written, read] : cases) {
    ASSERT_TRUE(WriteProfileString(In("a.ini"), "S", "Key", written));
    EXPECT_EQ(ReadProfileString(In("a.ini"), "S", "Key", "none", 256), read) << written;
  }
}

TEST_F(ProfileFile, KeepsOrderAndCase) {
  const std::string path = In("a.ini");
  const char* writes[][3] = {{"One", "B", "1"}, {"Two", "K", "2"},  {"One", "A", "3"},
                             {"ONE", "b", "4"}, {"two", "New", ""}, {"Two", "K", ""}};
  for (const auto& [section, key, value] : writes) {
    EXPECT_TRUE(WriteProfileString(path, section, key, value));
  }
  std::string text = Text(path);
  text.erase(
      std::unique(text.begin(), text.end(), [](char a, char b) { return a == '\n' && b == '\n'; }),
      text.end());  // the system may set a blank line between sections
  EXPECT_EQ(text, "[One]\nB=4\nA=3\n[Two]\nK=\nNew=\n");
  EXPECT_EQ(ReadProfileString(path, "TWO", "new", "none", 256), "");
  EXPECT_EQ(ReadProfileString(path, "oNE", "a", "none", 256), "3");
}

TEST_F(ProfileFile, GivesTheNumberAtAValuesStart) {
  const std::string path = In("a.ini");
  const std::pair<const char*, int32_t> cases[] = {
      {"12", 12}, {"-12", -12}, {"0", 0},   {"12abc", 12},  {"abc", 0},
      {"-", 0},   {" 7 ", 7},   {"007", 7}, {"\"12\"", 12}, {"2147483647", 2147483647}};
  for (const auto& [text, number] : cases) {
    ASSERT_TRUE(WriteProfileString(path, "S", "Number", text));
    EXPECT_EQ(ReadProfileInt(path, "S", "Number", 5), number) << text;
  }
  EXPECT_EQ(ReadProfileInt(path, "S", "None", -5), -5);
  EXPECT_EQ(ReadProfileInt(In("none.ini"), "S", "Number", 5), 5);
}

TEST_F(ProfileFile, ListsSectionsAsFarAsTheyFit) {
  const std::string path = In("a.ini");
  const auto names = [&path](uint32_t size) {
    const std::string all = ReadProfileSectionNames(path, size);
    EXPECT_LE(all.size(), size);
    return all.substr(0, all.find("\0\0"s) + 2);
  };
  EXPECT_EQ(names(100), "\0\0"s);
  WriteProfileString(path, "ab", "Key", "");
  WriteProfileString(path, "cde", "Key", "");
  const std::pair<uint32_t, std::string> cases[] = {
      {2, "\0\0"s},       {3, "a\0\0"s},       {5, "ab\0\0"s},      {6, "ab\0c\0\0"s},
      {7, "ab\0cd\0\0"s}, {8, "ab\0cde\0\0"s}, {9, "ab\0cde\0\0"s}, {100, "ab\0cde\0\0"s}};
  for (const auto& [size, expected] : cases) {
    EXPECT_EQ(names(size), expected) << size;
  }
}

TEST_F(ProfileFile, IsNotMadeWhereItCannotBe) {
  const std::string inNoFolder = In("none") + kPathSeparator + "a.ini";
  EXPECT_FALSE(WriteProfileString(inNoFolder, "S", "Key", "v"));
  fs::create_directory(In("folder.ini"));
  EXPECT_FALSE(WriteProfileString(In("folder.ini"), "S", "Key", "v"));
  EXPECT_EQ(ReadProfileString(In("folder.ini"), "S", "Key", "none", 256), "none");
  EXPECT_EQ(Names(Root), std::vector<std::string>{"folder.ini"});
}

TEST_F(ProfileFile, ChangesAtOnceWhenTheOutermostGuardEnds) {
  const std::string path = In("a.ini");
  WriteProfileString(path, "S", "Key", "old");
  const std::string before = Text(path);
  {
    const ProfileGuard guard(path);
    {
      const ProfileGuard inner(path);
      EXPECT_TRUE(WriteProfileString(path, "S", "Key", "new"));
      EXPECT_TRUE(WriteProfileString(path, "T", "Key", "more"));
    }
    EXPECT_EQ(ReadProfileString(path, "S", "Key", "", 256), "new");
    EXPECT_EQ(ReadProfileString(path, "T", "Key", "", 256), "more");
    EXPECT_EQ(Text(path), before);
  }
  EXPECT_EQ(ReadProfileString(path, "S", "Key", "", 256), "new");
  EXPECT_NE(Text(path), before);
  EXPECT_EQ(Names(Root), std::vector<std::string>{"a.ini"});
}

}  // namespace
