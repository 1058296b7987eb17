#include <benchmark/benchmark.h>

#include <functional>
#include <string>

#include "eventlog/logger.h"
#include "inventory/user_list.h"
#include "platform/posix/registry/registry_export.h"
#include "platform/profile_file.h"
#include "platform/profile_text.h"
#include "report/zipper.h"
#include "tests/support/scratch_folder.h"

// The parts whose cost depends on the size of a machine or a history.

namespace {

std::string EventName(int64_t number) {
  const std::string digits = std::to_string(number);
  return std::string(6 - digits.size(), '0') + digits;
}

std::string HistoryText(int64_t events) {
  std::string text = "[History]\nCount=" + std::to_string(events) + '\n';
  for (int64_t i = 0; i < events; ++i) {
    const std::string name = EventName(i);
    text += '[' + name + "]\nEvent_ID=" + name +
            "\nCommand_Line=setup.exe -silent\nStart_Time=20261124 21:05:07\n"
            "End_Time=20261124 21:09:41\nAction=Install\nType=GUI\nProduct=Server 9.1\n"
            "Version=9.1\nService_Level=SP2\nPath=/opt/orx/Copy1\nCopy_Name=Copy1\n"
            "Complete_Flag=TRUE\nLog_File_Name=(none)\nTrace_File=(none)\nResponse_File=(none)\n"
            "Event_Log_File=/var/lib/ZEK/ORXHistory/Copy1/" +
            name + "/ORXInstallEvent.Log\nResult=Success\n";
  }
  return text;
}

void ParseHistory(benchmark::State& state) {
  const std::string text = HistoryText(state.range(0));
  for (auto _ : state) {
    benchmark::DoNotOptimize(ProfileText(text).Get().data());
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

// The last key of a section, another section each time.
void FindKey(benchmark::State& state) {
  const int64_t events = state.range(0);
  const ProfileText history(HistoryText(events));
  int64_t number = 0;
  for (auto _ : state) {
    benchmark::DoNotOptimize(history.Find(EventName(number), "Result"));
    number = (number + events / 2 + 1) % events;
  }
}

// A value in the middle changes its length, so that all text after it moves.
void SetKey(benchmark::State& state) {
  ProfileText history(HistoryText(state.range(0)));
  const std::string name = EventName(state.range(0) / 2);
  bool isLong = false;
  for (auto _ : state) {
    history.Set(name, "Result", isLong ? "Success" : "Failed with a longer text");
    isLong = !isLong;
  }
}

// As a report reads: every access checks that the file is still the one that was parsed.
void ReadKeyOfFile(benchmark::State& state) {
  const ScratchFolder folder;
  const std::string file = folder.Make("History.ini", HistoryText(state.range(0)));
  const std::string name = EventName(state.range(0) / 2);
  for (auto _ : state) {
    benchmark::DoNotOptimize(ReadProfileValue(file, name, "Result", "", 256));
  }
}

std::string ExportText(int64_t keys) {
  std::string text = "Windows Registry Editor Version 5.00\r\n\r\n";
  for (int64_t i = 0; i < keys; ++i) {
    text += "[HKEY_LOCAL_MACHINE\\SOFTWARE\\Classes\\CLSID\\" + EventName(i) +
            "]\r\n@=\"Component\"\r\n\"Module\"=\"C:\\\\Windows\\\\module.dll\"\r\n"
            "\"Data\"=hex:a0,a1,a2,a3,a4,a5,a6,a7,a8,a9,aa,ab,ac,ad,ae,af,\\\r\n"
            "  b0,b1,b2,b3,b4,b5,b6,b7,b8,b9,ba,bb,bc,bd,be,bf\r\n\r\n";
  }
  return text + "[HKEY_LOCAL_MACHINE\\SOFTWARE\\ZEK\\ORX]\r\n\"Version\"=\"9.5\"\r\n";
}

// A first question: it reads the entire export once and keeps one branch.
void AskExport(benchmark::State& state) {
  const std::string text = ExportText(state.range(0));
  const auto read = ReaderOf(text);  // not copied with its text each time
  for (auto _ : state) {
    benchmark::DoNotOptimize(
        RegistryExport(std::ref(read)).Read("SOFTWARE\\ZEK\\ORX", "Version", 100));
  }
  state.SetBytesProcessed(state.iterations() * static_cast<int64_t>(text.size()));
}

void PackFolder(benchmark::State& state) {
  const ScratchFolder folder;
  const std::string text = HistoryText(40);
  for (int64_t i = 0; i < state.range(0); ++i) {
    folder.Make("history/" + EventName(i), text);
  }
  const std::string history = folder.In("history");
  for (auto _ : state) {
    CZipper zipper(folder.In("history.zip").c_str(), history.c_str());
    zipper.AddFolder(history);
  }
  state.SetBytesProcessed(state.iterations() * state.range(0) * static_cast<int64_t>(text.size()));
}

// The longest table of a snapshot: a line and a flush for each member of a group.
void PrintMembers(benchmark::State& state) {
  const ScratchFolder folder;
  CUsersList users;
  for (int64_t i = 0; i < state.range(0); ++i) {
    users.LocalMembers.push_back({"HOST\\user" + EventName(i), "group" + EventName(i / 10)});
  }
  for (auto _ : state) {
    CLogger::GetInstance().Open(folder.In("log"), std::ios::out);
    users.Print();
    CLogger::GetInstance().Close();
  }
  state.SetItemsProcessed(state.iterations() * state.range(0));
}

}  // namespace

BENCHMARK(ParseHistory)->Arg(10)->Arg(1000)->Arg(10000);
BENCHMARK(FindKey)->Arg(10)->Arg(1000)->Arg(10000);
BENCHMARK(SetKey)->Arg(10)->Arg(1000)->Arg(10000);
BENCHMARK(ReadKeyOfFile)->Arg(10)->Arg(10000);
BENCHMARK(AskExport)->Arg(10000);
BENCHMARK(PackFolder)->Arg(100);
BENCHMARK(PrintMembers)->Arg(5000);
