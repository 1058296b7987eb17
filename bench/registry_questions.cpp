#include <cstdio>
#include <string>
#include <vector>

#include "platform/registry.h"

// Reads from the machine's registry what a snapshot reads, and prints the number of calls.
// scripts/bench.sh measures the time of the process.

namespace {

size_t questions = 0;

std::vector<std::string> SubKeys(const std::string& key) {
  ++questions;
  return EnumRegistrySubKeys(key);
}

void ReadValue(const std::string& key, const std::string& name) {
  ++questions;
  ReadRegistryData(key, name, /*limit=*/100, RegistryAccess::kReadAndSet);
}

void ReadAllValues(const std::string& key) {
  ++questions;
  for (const std::string& name : EnumRegistryValueNames(key)) {
    ReadValue(key, name);
  }
}

void AskForSoftware() {
  const std::string root =
      "SOFTWARE\\Microsoft\\Windows\\CurrentVersion\\Installer\\UserData\\S-1-5-18\\Products";
  for (const std::string& product : SubKeys(root)) {
    for (const char* name : {"DisplayName", "DisplayVersion", "InstallDate", "InstallLocation",
                             "Language", "Publisher"}) {
      ReadValue(root + "\\" + product + "\\InstallProperties", name);
    }
  }
}

void AskForCopies(const std::string& root) {
  for (const std::string& copy : SubKeys(root)) {
    ReadAllValues(root + "\\" + copy + "\\GLOBAL_PROFILE");
    SubKeys(root + "\\" + copy + "\\PROFILES");
    SubKeys(root + "\\" + copy + "\\ADM_PROFILES");
    SubKeys(root + "\\" + copy);
  }
}

void AskForDrivers() {
  const std::string catalogue = "SOFTWARE\\ODBC\\ODBCINST.INI";
  ++questions;
  for (const std::string& driver : EnumRegistryValueNames(catalogue + "\\ODBC Drivers")) {
    ReadAllValues(catalogue + "\\" + driver);
  }
}

}  // namespace

int main() {
  AskForSoftware();
  AskForCopies("SOFTWARE\\ZEK");
  AskForCopies("SOFTWARE\\ZEK\\ORX\\InstalledCopies");
  AskForDrivers();
  std::printf("%zu questions\n", questions);
  return questions > 1000 ? 0 : 1;
}
