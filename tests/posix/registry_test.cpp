#include "platform/registry.h"

#include <gtest/gtest.h>
#include <iconv.h>
#include <sys/stat.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>

#include "platform/posix/registry_export.h"

namespace {

using namespace std::string_literals;

const std::string header = "Windows Registry Editor Version 5.00\n\n";

ByteReader ReaderOf(const std::string& bytes) {
  return [&bytes](uint64_t offset, char* buffer, size_t size) {
    return offset < bytes.size() ? bytes.copy(buffer, size, offset) : 0;
  };
}

std::string Dump(RegistryExport& registry, const std::string& path) {
  std::string text = "[" + path + "]\n";
  for (const std::string& name : registry.ValueNames(path)) {
    const RegistryData data = registry.Read(path, name, 1000);
    text += name + "=" + std::to_string(data.Type) + ":";
    for (const char c : data.Bytes) {
      if (c >= '\0' && c < ' ') {
        text += "<" + std::to_string(c) + ">";
      } else {
        text += c;
      }
    }
    text += '\n';
  }
  for (const std::string& name : registry.SubKeyNames(path)) {
    text += Dump(registry, path.empty() ? name : path + "\\" + name);
  }
  return text;
}

std::string Dump(const std::string& bytes, const std::string& path = "") {
  RegistryExport registry(ReaderOf(bytes));
  return Dump(registry, path);
}

std::string WithCarriageReturns(std::string text) {
  for (size_t at = 0; (at = text.find('\n', at)) != std::string::npos; at += 2) {
    text.insert(at, 1, '\r');
  }
  return text;
}

std::string AsUtf16(std::string text) {
  const iconv_t converter = ::iconv_open("UTF-16LE", "UTF-8");
  std::string wide(2 * text.size(), '\0');
  char* in = text.data();
  char* out = wide.data();
  size_t inLeft = text.size();
  size_t outLeft = wide.size();
  ::iconv(converter, &in, &inLeft, &out, &outLeft);
  ::iconv_close(converter);
  wide.resize(wide.size() - outLeft);
  return "\xFF\xFE" + wide;
}

const std::string wholeExport = header + R"(; a comment
[HKEY_CURRENT_USER\SOFTWARE\ZEK]
"Not"="ours"

[HKEY_LOCAL_MACHINE\SOFTWARE\ZEK\ORX]
@="default"
"Text"="C:\\Dir\\ with \"marks\" [x]" ; a comment
  "Na\"me\\"  =  "größe 漢字 😀"
"Empty"=""
"Trap"="上[HKEY_LOCAL_MACHINE\\TRAP]"
"Two Lines"="one
[section]
two"
"Escaped"="one\r\ntwo\x"
"Number"=dword:8000000F
"Binary"=hex:00,1,fF,\
  7e
"None"=hex(0):
"HexText"=hex(1):e4,00,62,00,00,00
"Unpaired"=hex(1):3d,d8,62,00,00,dc,3d,d8,00,de,3d
"Expand"=hex(2):25,00,\
  ; within
"HexNumber"=hex(4):01,02,03,04
"Multi"=hex(7):61,00,00,00,62,00,00,00,00,00
"Long"=hex(b):01,00,00,00,00,00,00,80
"Other"=hex(ffff0012):41
"Gone"="x"
"GONE"=-

[hkey_local_machine\Software\zek\Second]
[HKEY_LOCAL_MACHINE\SOFTWARE\ZEK\Removed\Below]
[HKEY_LOCAL_MACHINE\SOFTWARE\ZEK\[Brackets] ]
[-HKEY_LOCAL_MACHINE\SOFTWARE\ZEK\removed]
[HKEY_LOCAL_MACHINE\SYSTEM\]
[HKEY_LOCAL_MACHINE\SOFTWARE\zek\orx]
"TEXT"="later"
"New"="n"
[HKEY_LOCAL_MACHINE\SOFTWARE\ZEK\Removed]
"Back"="again")";

const std::string wholeTree = R"([]
[SOFTWARE]
[SOFTWARE\ZEK]
[SOFTWARE\ZEK\ORX]
=1:default<0>
Text=1:later<0>
Na"me\=1:größe 漢字 😀<0>
Empty=1:<0>
Trap=1:上[HKEY_LOCAL_MACHINE\TRAP]<0>
Two Lines=1:one<10>[section]<10>two<0>
Escaped=1:one<13><10>two\x<0>
Number=4:<15><0><0>)"
                              "\x80"
                              R"(
Binary=3:<0><1>)"
                              "\xFF"
                              R"(~
None=0:
HexText=1:äb<0>
Unpaired=1:�b�😀
HexNumber=4:<1><2><3><4>
Multi=7:a<0>b<0><0>
Long=11:<1><0><0><0><0><0><0>)"
                              "\x80"
                              R"(
Other=4294901778:A
New=1:n<0>
[SOFTWARE\ZEK\Second]
[SOFTWARE\ZEK\[Brackets] ]
[SOFTWARE\ZEK\Removed]
Back=1:again<0>
[SYSTEM]
)";

TEST(Registry, ReadsEveryFormOfExport) {
  EXPECT_EQ(Dump(wholeExport), wholeTree);
  EXPECT_EQ(Dump("\xEF\xBB\xBF" + wholeExport), wholeTree);
  EXPECT_EQ(Dump(AsUtf16(wholeExport)), wholeTree);
  std::string treeOfTwo = wholeTree;
  treeOfTwo.replace(treeOfTwo.find("one<10>"), 7, "one<13><10>");
  treeOfTwo.replace(treeOfTwo.find("]<10>two"), 8, "]<13><10>two");
  EXPECT_EQ(Dump(WithCarriageReturns(wholeExport)), treeOfTwo);
  EXPECT_EQ(Dump(AsUtf16(WithCarriageReturns(wholeExport))), treeOfTwo);
}

TEST(Registry, ReadsNarrowHexTextOfTheOlderForm) {
  EXPECT_EQ(Dump("REGEDIT4\r\n\r\n[HKEY_LOCAL_MACHINE\\S]\r\n\"T\"=hex(1):61,62,00\r\n"
                 "\"E\"=hex(2):25,00\r\n\"M\"=hex(7):61,00,00\r\n\"B\"=hex:61,00\r\n",
                 "S"),
            "[S]\nT=1:ab<0>\nE=2:%<0>\nM=7:a<0><0>\nB=3:a<0>\n");
}

TEST(Registry, DamageCostsItsLine) {
  const std::pair<std::string, std::string> cases[] = {
      {"\"open", ""},
      {"\"open\"=\"text", ""},
      {"\"open\"=\"text\\", ""},
      {"\"a\"", ""},
      {"\"a\"=", ""},
      {"\"a\"=\"b\" c", ""},
      {"\"a\"=word:1", ""},
      {"\"a\"=dword:", ""},
      {"\"a\"=dword:g", ""},
      {"\"a\"=dword:123456789", ""},
      {"\"a\"=dword:1g", ""},
      {"\"a\"=hex", ""},
      {"\"a\"=hex(1:61", ""},
      {"\"a\"=hex(123456789):61", ""},
      {"\"a\"=hex:61,", ""},
      {"\"a\"=hex:61,\\", ""},
      {"\"a\"=hex:61,,62", ""},
      {"\"a\"=hex:161", ""},
      {"\"a\"=hex:61 62", ""},
      {"\"a\"=-1", ""},
      {"a=b", ""},
      {"\\\\\\", ""},
      {"\0\0\0"s, ""},
      {"[HKEY_LOCAL_MACHINE\\S\n\"a\"=\"lost\"\n[HKEY_LOCAL_MACHINE\\S]", ""},
      {"[HKEY_LOCAL_MACHINE\\S\\\\T]\n\"a\"=\"lost\"\n[HKEY_LOCAL_MACHINE\\S]", ""},
      {"[HKEY_LOCAL\n\"a\"=\"lost\"\n[HKEY_LOCAL_MACHINE\\S]", ""},
      {"[S]\n\"a\"=\"lost\"\n[HKEY_LOCAL_MACHINE\\S]", ""},
      {"[HKEY_LOCAL_MACHINEX\\S]\n\"a\"=\"lost\"\n[HKEY_LOCAL_MACHINE\\S]", ""},
  };
  for (const auto& [line, values] : cases) {
    const std::string text = header + "[HKEY_LOCAL_MACHINE\\S]\n\"before\"=\"1\"\n" + line +
                             "\n\"behind\"=\"2\"\n@=\"3\"\n";
    const std::string tree = "[S]\nbefore=1:1<0>\n" + values + "behind=1:2<0>\n=1:3<0>\n";
    EXPECT_EQ(Dump(text, "S"), tree) << line;
    EXPECT_EQ(Dump(AsUtf16(text), "S"), tree) << line;
  }
}

TEST(Registry, ReadsWhatStandsInFrontOfACut) {
  const std::pair<std::string, std::string> cases[] = {
      {wholeExport, "Second"},
      {AsUtf16(WithCarriageReturns(wholeExport)), AsUtf16("Second").substr(2)},
  };
  for (const auto& [whole, marker] : cases) {
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
  const std::string key = "[HKEY_LOCAL_MACHINE\\S";
  const std::string text = header + key + "]\n\"" + fits + "\"=\"abc\"\n\"" + tooLong +
                           "\"=\"abc\"\n\"behind\"=\"abc\"\n" + key + "\\" + fits + "]\n" + key +
                           "\\" + tooLong + "]\n" + key + "\\behind]\n";
  RegistryExport registry(ReaderOf(text));
  EXPECT_EQ(registry.ValueNames("S"), std::vector{fits});
  EXPECT_EQ(registry.SubKeyNames("S"), std::vector{fits});
  EXPECT_EQ(registry.Read("S", "behind", 4).Bytes, "abc\0"s);
  EXPECT_EQ(registry.Read("S", "behind", 3).Bytes, "");
  EXPECT_EQ(registry.Read("S", "behind", 3).Type, kRegistryText);
  EXPECT_EQ(registry.Read("S", "none", 4).Type, 0U);
  EXPECT_EQ(registry.Read("none", "behind", 4).Type, 0U);
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
  const std::string key = header + "[HKEY_LOCAL_MACHINE\\S]\n";
  const std::string behind = "\n\"behind\"=\"2\"\n";
  const std::string deepPath = "S" + Repeated("\\k", 10000);
  const std::string monsters[] = {
      Repeated("[", many),
      Repeated("[\n", many),
      Repeated("\\", many),
      Repeated("\\\n", many),
      Repeated("\"", many),
      Repeated("\"\n", many),
      Repeated("\"a\"=\"\n", many),
      Repeated("@=hex:\\\n", many),
      Repeated(" ", megabytes),
      "\"a\"=hex:00" + Repeated(",\\\n00", many) + ",",
      "\"a\"=\"" + Repeated("x", megabytes),
      "\"a\"=\"" + Repeated("no end\n", many),
      Repeated("[HKEY_LOCAL_MACHINE\\S]\n[-HKEY_LOCAL_MACHINE\\S]\n", many / 10),
      "[HKEY_LOCAL_MACHINE\\" + deepPath + "]\n",
      "[HKEY_LOCAL_MACHINE\\" + Repeated("x", megabytes) + "]\n",
  };
  for (const std::string& monster : monsters) {
    const std::string text = key + monster + "\n[HKEY_LOCAL_MACHINE\\S]" + behind;
    for (const std::string& bytes : {text, AsUtf16(text)}) {
      RegistryExport registry(ReaderOf(bytes));
      EXPECT_EQ(registry.Read("S", "behind", 100).Bytes, "2\0"s) << monster.substr(0, 40);
    }
  }
  const std::string deep = header + "[HKEY_LOCAL_MACHINE\\" + deepPath + "]" + behind;
  RegistryExport registry(ReaderOf(deep));
  EXPECT_EQ(registry.SubKeyNames("S\\k\\k"), std::vector{"k"s});
  EXPECT_EQ(registry.Read(deepPath, "behind", 100).Bytes, "2\0"s);
}

TEST(Registry, DoesNotReadMoreForMoreKeys) {
  const std::string catalogue = "SOFTWARE\\ODBC\\ODBCINST.INI\\";
  std::string text = header;
  for (int i = 0; i < 1000; ++i) {
    text += "[HKEY_LOCAL_MACHINE\\SOFTWARE\\Other\\" + std::to_string(i) + "]\n\"a\"=\"b\"\n";
  }
  for (int i = 0; i < 1000; ++i) {
    text += "[HKEY_LOCAL_MACHINE\\" + catalogue + std::to_string(i) + "]\n\"a\"=\"b\"\n";
  }
  size_t bytesRead = 0;
  RegistryExport registry([&](uint64_t offset, char* buffer, size_t size) {
    const size_t got = ReaderOf(text)(offset, buffer, size);
    bytesRead += got;
    return got;
  });
  for (int i = 0; i < 1000; ++i) {
    EXPECT_EQ(registry.Read(catalogue + std::to_string(i), "a", 100).Bytes, "b\0"s);
  }
  EXPECT_LT(bytesRead, 4 * text.size());
}

TEST(Registry, FindsTheExportOfTheMachine) {
  const std::filesystem::path root =
      std::filesystem::temp_directory_path() / ("orx-registry-" + std::to_string(::getpid()));
  const auto nameOf = [&](const char* folder) {
    std::filesystem::create_directories(root / folder / "ZEK");
    return root / folder / "ZEK" / "Registry.reg";
  };
  std::ofstream(nameOf("file")) << header << "[HKEY_LOCAL_MACHINE\\S]\n\"a\"=\"b\"\n";
  std::filesystem::create_symlink(nameOf("file"), nameOf("link"));
  std::filesystem::create_directory(nameOf("folder"));
  ::mkfifo(nameOf("pipe").c_str(), 0600);
  const std::pair<const char*, bool> cases[] = {
      {"file", true}, {"link", true}, {"folder", false}, {"pipe", false}, {"missing", false}};
  for (const auto& [folder, isThere] : cases) {
    ::setenv("ORX_COMMON_APPDATA", (root / folder).c_str(), 1);
    EXPECT_EQ(EnumRegistrySubKeys("").size(), isThere ? 1U : 0U) << folder;
    EXPECT_EQ(EnumRegistryValueNames("S").size(), isThere ? 1U : 0U) << folder;
    EXPECT_EQ(ReadRegistryData("S", "A", 100, RegistryAccess::kReadAndSet).Bytes,
              isThere ? "b\0"s : "")
        << folder;
  }
  ::unsetenv("ORX_COMMON_APPDATA");
  std::filesystem::remove_all(root);
}

}  // namespace
