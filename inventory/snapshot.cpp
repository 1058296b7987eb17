#include <string>

#include "app/install_event.h"
#include "eventlog/logger.h"
#include "inventory/process_list.h"
#include "inventory/service_list.h"
#include "inventory/software_list.h"
#include "inventory/user_list.h"
#include "products/copy_generation.h"
#include "products/odbc_drivers.h"
#include "products/products_list.h"

// The rows of the user, software and service tables turn left adjustment on at the stream, and it
// stays on: every later value with a field width is padded on its right, before the first such row
// on its left.

namespace {

void WriteBox(std::initializer_list<std::string> lines) {
  CLogger& log = CLogger::GetInstance();
  const std::string stars(94, '*');
  log << stars << std::endl;
  for (const std::string& line : lines) {
    log << line << std::endl;
  }
  log << stars << std::endl;
}

template <typename List>
void WriteList() {
  List list;
  list.Collect();
  list.Print();
}

}  // namespace

void CInstallEvent::WriteSnapshot() {
  const std::string blankLine = "*" + std::string(93, ' ');
  if (Mode == "-start") {
    WriteBox({"*  Snapshoot for EventID: " + EventID + " -- Before " + GetAction() + " Starts ",
              blankLine});
  } else if (Mode == "-end") {
    WriteBox({blankLine,
              "*  Snapshoot for EventID: " + EventID + " -- After " + GetAction() + " Completed ",
              blankLine});
  }
  WriteUserSection();
  WriteSoftwareSection();
  WriteProcessSection();
  WriteServiceSection();
  WriteProductSection();
  WriteODBCSection();
  if (Mode == "-start") {
    WriteBox(
        {"* End of Snapshoot for EventID: " + EventID + " Before " + GetAction() + " Starts  "});
  } else if (Mode == "-end") {
    WriteBox(
        {"*End of Snapshoot for EventID: " + EventID + " -- After " + GetAction() + " Completed "});
  }
}

void CInstallEvent::WriteSectionHeading(const char* title) {
  CLogger& log = CLogger::GetInstance();
  log << std::endl;
  log << SectionNumber << title << std::endl;
  ++SectionNumber;
}

void CInstallEvent::WriteUserSection() {
  WriteSectionHeading(") User Group & User Information:");
  WriteList<CUsersList>();
}

void CInstallEvent::WriteSoftwareSection() {
  WriteSectionHeading(") Software Installed on the machine:");
  WriteList<CProductsList>();
}

void CInstallEvent::WriteProcessSection() {
  WriteSectionHeading(") Current Running Processes:");
  WriteList<CProcessList>();
}

void CInstallEvent::WriteServiceSection() {
  WriteSectionHeading(") Services & Service Status:");
  WriteList<CServicesList>();
}

void CInstallEvent::WriteProductSection() {
  WriteSectionHeading(") ORX Products Installed:");
  CORXProductsList list;
  for (const int32_t generation : {0, 1}) {
    SetCopyGeneration(generation);
    list.Collect();
    list.Print();
    list.Clear();
  }
}

void CInstallEvent::WriteODBCSection() {
  WriteSectionHeading(") ORX ODBC Driver Info:");
  WriteList<CODBCDriversList>();
}
