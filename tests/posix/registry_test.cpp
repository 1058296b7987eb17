// The registry that an export describes: the files in registry_cases/ in every encoding, and
// exports that are large, damaged or hostile.

#include "platform/registry.h"

#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>

#include "platform/posix/registry/registry_export.h"
#include "tests/support/scratch_folder.h"

namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

const std::string hive = "[HKEY_LOCAL_MACHINE\\";

std::string Case(const std::string& name) {
  return FileText(ORX_POSIX_TESTS "/registry_cases/" + name);
}

// A key and all below it: values as name=type:data, in which a byte can be <number>.
std::string Dump(RegistryExport& registry, const std::string& path = "") {
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

std::string AsUtf16(const std::string& text) {
  const std::u16string wide = fs::path(text).u16string();  // of all classes, a path can convert
  return "\xFF\xFE" + std::string(reinterpret_cast<const char*>(wide.data()), 2 * wide.size());
}

TEST(Registry, ReadsEveryFormOfExport) {
  for (const std::string name : {"every_form", "older_form", "damaged_lines"}) {
    for (const std::string lineEnd : {"\n", "\r\n"}) {
      const std::string shownEnd = lineEnd == "\n" ? "<10>" : "<13><10>";
      const std::string text = Replaced(Case(name + ".reg"), "\n", lineEnd);
      const std::string tree = Replaced(Case(name + ".txt"), "<line end>", shownEnd);
      for (const std::string& form : {text, "\xEF\xBB\xBF" + text, AsUtf16(text)}) {
        RegistryExport registry(ReaderOf(form));
        EXPECT_EQ(Dump(registry), tree) << name;
      }
    }
  }
}

TEST(Registry, ReadsATruncatedExport) {
  const std::string text = Case("every_form.reg");
  for (const auto& [complete, marker] :
       {std::pair(text, "Second"s), std::pair(AsUtf16(text), AsUtf16("Second").substr(2))}) {
    const size_t firstKeyEnd = complete.find(marker);
    for (size_t size = firstKeyEnd; size < complete.size(); size += 3) {
      RegistryExport registry(ReaderOf(complete.substr(0, size)));
      EXPECT_NE(Dump(registry).find("\nOther=4294901778:A\n"), std::string::npos);
    }
  }
}

// A heading with more than Windows allows is damaged; a name that is allowed but does not fit the
// limit of the interface ends a list.
TEST(Registry, KeepsTheLimitsOfNames) {
  const std::string longest = Repeated("l", 255);
  const std::string pairs = Repeated("😀", 128);  // 256 characters of Windows
  const std::string wide = Repeated("ß", 255);   // 510 bytes
  std::string text;
  for (const std::string& name : {longest, longest + "l", pairs, "after"s, wide, "unseen"s}) {
    text += hive + "S]\n\"" + name + "\"=\"abc\"\n" + hive + "S\\" + name + "]\n@=\"of " + name +
            "\"\n";
  }
  RegistryExport registry(ReaderOf(text));
  EXPECT_EQ(registry.ValueNames("S"), std::vector{longest});
  EXPECT_EQ(registry.SubKeyNames("S"), (std::vector{longest, "after"s}));
  EXPECT_EQ(registry.Read("S", longest + "l", 4).Bytes, "abc\0"s);
  EXPECT_EQ(registry.ValueNames("S\\" + longest + "l").size(), 0U);
  EXPECT_EQ(registry.Read("S\\" + wide, "", 1000).Bytes, "of " + wide + '\0');
  EXPECT_EQ(registry.Read("S", "after", 3).Bytes, "");
  EXPECT_EQ(registry.Read("S", "after", 3).Type, kRegistryText);
  EXPECT_EQ(registry.Read("S", "none", 4).Type, 0U);
  for (const size_t levels : {512, 513}) {
    const std::string path = "S" + Repeated("\\k", levels - 1);
    EXPECT_EQ(RegistryExport(ReaderOf(hive + path + "]\n@=\"1\"\n")).Read(path, "", 9).Bytes,
              levels == 512 ? "1\0"s : "");
  }
}

// Whatever was queried before.
TEST(Registry, IgnoresABackslashAtTheEndOfAPath) {
  for (const std::string earlier : {"", "A\\B", "A\\B\\", "A\\B\\C\\", "A\\B\\C\\\\"}) {
    RegistryExport registry(ReaderOf(hive + "A\\B\\C]\n\"a\"=\"b\"\n"));
    registry.SubKeyNames(earlier);
    registry.ValueNames(earlier);
    EXPECT_EQ(registry.Read("A\\B\\C\\", "a", 9).Bytes, "b\0"s) << earlier;
    EXPECT_EQ(registry.SubKeyNames("A\\B\\").size(), 1U) << earlier;
    for (const std::string noKey : {"A\\B\\C\\\\", "A\\\\B\\C", "\\A\\B\\C"}) {
      EXPECT_EQ(registry.ValueNames(noKey).size() + registry.SubKeyNames(noKey).size(), 0U);
    }
  }
}

TEST(Registry, HasNothingBelowAKeyThatIsRemovedLater) {
  const std::string text = hive + "A\\B\\C]\n\"a\"=\"b\"\n[-HKEY_LOCAL_MACHINE\\A]\n";
  EXPECT_EQ(RegistryExport(ReaderOf(text)).Read("A\\B\\C", "a", 9).Type, 0U);
}

// With a careless parser each of these takes minutes or overflows the stack.
TEST(Registry, ReadsHugeLinesInLinearTime) {
  constexpr size_t many = 50000;
  constexpr size_t megabytes = 2 << 20;
  const std::string key = hive + "S]\n";
  const std::string levels = Repeated("\\k", megabytes / 2);
  const std::string hugeLines[] = {Repeated(" ", megabytes),
                                   Repeated(key + "[-HKEY_LOCAL_MACHINE\\S]\n", many / 10),
                                   "\"a\"=hex:00" + Repeated(",\\\n00", many) + ",",
                                   "\"a\"=\"" + Repeated("x", megabytes),
                                   "\"a\"=\"" + Repeated("no end\n", many),
                                   hive + "S" + levels + "]",
                                   "[-HKEY_LOCAL_MACHINE" + levels + "]",
                                   Repeated("[", many) + Repeated("\\\n", many),
                                   Repeated("\"", many) + Repeated("\"a\"=\"\n", many),
                                   Repeated("\0"s, many) + Repeated("@=hex:\\", many)};
  for (const std::string& huge : hugeLines) {
    const std::string text = key + huge + '\n' + key + "\"after\"=\"2\"\n";
    for (const std::string& bytes : {text, AsUtf16(text)}) {
      RegistryExport registry(ReaderOf(bytes));
      EXPECT_EQ(registry.Read("S", "after", 100).Bytes, "2\0"s) << huge.substr(0, 40);
      EXPECT_EQ(registry.SubKeyNames("S").size(), 0U);
    }
  }
}

// Neither for more keys nor for subkeys that do not exist.
TEST(Registry, DoesNotReadMoreForMoreQueries) {
  std::string text;
  for (int i = 0; i < 2000; ++i) {
    const std::string parent = i < 1000 ? "SOFTWARE\\Other\\" : "SOFTWARE\\ZEK\\ORX\\";
    text += hive + parent + std::to_string(i) + "]\n\"a\"=\"b\"\n";
  }
  size_t bytesRead = 0;
  RegistryExport registry(
      [&bytesRead, read = ReaderOf(text)](uint64_t offset, char* buffer, size_t size) {
        const size_t got = read(offset, buffer, size);
        bytesRead += got;
        return got;
      });
  for (int i = 1000; i < 2000; ++i) {
    const std::string path = "SOFTWARE\\ZEK\\ORX\\" + std::to_string(i);
    EXPECT_EQ(registry.Read(path, "a", 100).Bytes, "b\0"s);
    EXPECT_EQ(registry.Read(path + "\\x\\" + std::to_string(i), "a", 100).Type, 0U);
  }
  EXPECT_LT(bytesRead, 3 * text.size());
}

TEST(Registry, FindsTheExportOfTheMachine) {
  const ScratchFolder scratch;
  scratch.Make("folder/ZEK/Registry.reg/");
  scratch.Make("link/ZEK/");
  scratch.Make("pipe/ZEK/");
  ::mkfifo(scratch.In("pipe/ZEK/Registry.reg").c_str(), 0600);
  fs::create_symlink(scratch.Make("export", hive + "S]\n\"a\"=\"b\"\n"),
                     scratch.In("link/ZEK/Registry.reg"));
  for (const std::string kind : {"link", "folder", "pipe", "missing"}) {
    ::setenv("ORX_COMMON_APPDATA", scratch.In(kind).c_str(), /*overwrite=*/1);
    const size_t found = kind == "link" ? 1 : 0;
    EXPECT_EQ(EnumRegistrySubKeys("").size(), found) << kind;
    EXPECT_EQ(EnumRegistryValueNames("S").size(), found) << kind;
    EXPECT_EQ(ReadRegistryData("S", "A", 9, RegistryAccess::kReadAndSet).Bytes,
              found == 1 ? "b\0"s : "");
  }
  ::unsetenv("ORX_COMMON_APPDATA");
}

}  // namespace
