// The registry of an export: what the files in registry_cases/ make, in every encoding, and what a
// reader of large and of strange files must withstand.

#include "platform/registry.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <regex>

#include "platform/posix/registry_export.h"
#include "tests/support/file_text.h"

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

const std::string header = "Windows Registry Editor Version 5.00\n\n";

std::string Case(const std::string& name) { return FileText(ORX_REGISTRY_CASES "/" + name); }

ByteReader ReaderOf(const std::string& bytes) {
  return [&bytes](uint64_t offset, char* buffer, size_t size) {
    return offset < bytes.size() ? bytes.copy(buffer, size, offset) : 0;
  };
}

// A key and all below it: values as name=type:data, in which a byte can stand as <number>.
std::string Dump(RegistryExport& registry, const std::string& path) {
  std::string text = "[" + path + "]\n";
  for (const std::string& name : registry.ValueNames(path)) {
    const RegistryData data = registry.Read(path, name, 1000);
    const bool isText = data.Type == kRegistryText || data.Type == 2 || data.Type == 7;
    text += name + '=' + std::to_string(data.Type) + ':';
    for (const char c : data.Bytes) {
      const auto byte = static_cast<uint8_t>(c);
      const bool isShown = byte >= ' ' && (isText || byte < 0x7F);
      text += isShown ? std::string(1, c) : '<' + std::to_string(byte) + '>';
    }
    text += '\n';
  }
  for (const std::string& name : registry.SubKeyNames(path)) {
    text += Dump(registry, path.empty() ? name : path + "\\" + name);
  }
  return text;
}

std::string Dump(const std::string& bytes) {
  RegistryExport registry(ReaderOf(bytes));
  return Dump(registry, "");
}

std::string AsUtf16(const std::string& text) {
  const std::u16string wide = fs::path(text).u16string();  // of all classes, a path can convert
  return "\xFF\xFE" + std::string(reinterpret_cast<const char*>(wide.data()), 2 * wide.size());
}

TEST(Registry, ReadsEveryFormOfExport) {
  for (const std::string name : {"every_form", "older_form", "damaged_lines"}) {
    for (const std::string lineEnd : {"\n", "\r\n"}) {
      const std::string shownEnd = lineEnd == "\n" ? "<10>" : "<13><10>";
      const std::string text = std::regex_replace(Case(name + ".reg"), std::regex("\n"), lineEnd);
      const std::string tree =
          std::regex_replace(Case(name + ".txt"), std::regex("<line end>"), shownEnd);
      for (const std::string& form : {text, "\xEF\xBB\xBF" + text, AsUtf16(text)}) {
        EXPECT_EQ(Dump(form), tree) << name;
      }
    }
  }
}

TEST(Registry, ReadsWhatStandsInFrontOfACut) {
  const std::string text = Case("every_form.reg");
  for (const auto& [whole, marker] :
       {std::pair(text, "Second"s), std::pair(AsUtf16(text), AsUtf16("Second").substr(2))}) {
    const size_t firstKeyEnd = whole.find(marker);
    for (size_t size = 0; size < whole.size(); size += 3) {
      const std::string tree = Dump(whole.substr(0, size));
      const bool hasFirstKey = tree.find("\nOther=4294901778:A\n") != std::string::npos;
      EXPECT_TRUE(hasFirstKey || size < firstKeyEnd) << size;
    }
  }
}

TEST(Registry, KeepsTheLimitsOfTheSeam) {
  const std::string fits(255, 'f');
  const std::string tooLong(256, 'l');
  std::string text = header;
  for (const std::string& name : {fits, tooLong, "behind"s}) {
    text += "[HKEY_LOCAL_MACHINE\\S]\n\"" + name + "\"=\"abc\"\n[HKEY_LOCAL_MACHINE\\S\\" + name +
            "]\n";
  }
  EXPECT_EQ(Dump(text), "[]\n[S]\n" + fits + "=1:abc<0>\n[S\\" + fits + "]\n");
  RegistryExport registry(ReaderOf(text));
  EXPECT_EQ(registry.Read("S", "behind", 4).Bytes, "abc\0"s);
  EXPECT_EQ(registry.Read("S", "behind", 3).Bytes, "");
  EXPECT_EQ(registry.Read("S", "behind", 3).Type, kRegistryText);
  EXPECT_EQ(registry.Read("S", "none", 4).Type, 0U);
}

std::string Repeated(const std::string& text, size_t times) {
  std::string result;
  for (size_t i = 0; i < times; ++i) {
    result += text;
  }
  return result;
}

// Each of these takes long, or all of the stack, with a reader that is careless about it.
TEST(Registry, EnduresMonstrousExports) {
  constexpr size_t many = 200000;
  constexpr size_t megabytes = 5 << 20;
  const std::string key = "[HKEY_LOCAL_MACHINE\\S]\n";
  const std::string deepPath = "S" + Repeated("\\k", 10000);
  std::vector<std::string> monsters = {Repeated(" ", megabytes),
                                       Repeated(key + "[-HKEY_LOCAL_MACHINE\\S]\n", many / 10),
                                       "\"a\"=hex:00" + Repeated(",\\\n00", many) + ",",
                                       "\"a\"=\"" + Repeated("x", megabytes),
                                       "\"a\"=\"" + Repeated("no end\n", many),
                                       "[HKEY_LOCAL_MACHINE\\" + Repeated("x", megabytes) + "]",
                                       "[HKEY_LOCAL_MACHINE\\" + deepPath + "]\n\"deep\"=\"1\""};
  for (const std::string& line : {"["s, "\\"s, "\""s, "\0"s, "\"a\"=\""s, "@=hex:\\"s}) {
    monsters.push_back(Repeated(line, many));
    monsters.push_back(Repeated(line + '\n', many));
  }
  for (const std::string& monster : monsters) {
    const std::string text = header + key + monster + '\n' + key + "\"behind\"=\"2\"\n";
    for (const std::string& bytes : {text, AsUtf16(text)}) {
      RegistryExport registry(ReaderOf(bytes));
      EXPECT_EQ(registry.Read("S", "behind", 100).Bytes, "2\0"s) << monster.substr(0, 40);
      const bool isDeep = monster.find("deep") != std::string::npos;
      EXPECT_EQ(registry.Read(deepPath, "deep", 100).Bytes, isDeep ? "1\0"s : "");
    }
  }
}

TEST(Registry, DoesNotReadMoreForMoreKeys) {
  std::string text = header;
  for (int i = 0; i < 2000; ++i) {
    const std::string parent = i < 1000 ? "SOFTWARE\\Other\\" : "SOFTWARE\\ZEK\\ORX\\";
    text += "[HKEY_LOCAL_MACHINE\\" + parent + std::to_string(i) + "]\n\"a\"=\"b\"\n";
  }
  size_t bytesRead = 0;
  RegistryExport registry([&](uint64_t offset, char* buffer, size_t size) {
    const size_t got = ReaderOf(text)(offset, buffer, size);
    bytesRead += got;
    return got;
  });
  for (int i = 1000; i < 2000; ++i) {
    const std::string path = "SOFTWARE\\ZEK\\ORX\\" + std::to_string(i);
    EXPECT_EQ(registry.Read(path, "a", 100).Bytes, "b\0"s);
  }
  EXPECT_LT(bytesRead, 4 * text.size());
}

TEST(Registry, FindsTheExportOfTheMachine) {
  const fs::path root = fs::temp_directory_path() / ("orx-registry-" + std::to_string(::getpid()));
  fs::create_directory(root);
  std::ofstream(root / "export") << header << "[HKEY_LOCAL_MACHINE\\S]\n\"a\"=\"b\"\n";
  for (const std::string kind : {"link", "folder", "pipe", "missing"}) {
    const fs::path path = root / kind / "ZEK" / "Registry.reg";
    fs::create_directories(kind == "folder" ? path : path.parent_path());
    if (kind == "link") {
      fs::create_symlink(root / "export", path);
    } else if (kind == "pipe") {
      ::mkfifo(path.c_str(), 0600);
    }
    ::setenv("ORX_COMMON_APPDATA", (root / kind).c_str(), /*overwrite=*/1);
    const bool isThere = kind == "link";
    EXPECT_EQ(!EnumRegistrySubKeys("").empty(), isThere) << kind;
    EXPECT_EQ(!EnumRegistryValueNames("S").empty(), isThere) << kind;
    EXPECT_EQ(ReadRegistryData("S", "A", 9, RegistryAccess::kReadAndSet).Bytes == "b\0"s, isThere);
  }
  ::unsetenv("ORX_COMMON_APPDATA");
  fs::remove_all(root);
}

}  // namespace
