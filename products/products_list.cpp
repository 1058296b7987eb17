#include "products/products_list.h"

#include <utility>

#include "eventlog/logger.h"
#include "platform/registry.h"
#include "products/copy_generation.h"

int32_t CORXProductsList::Collect() {
  for (const std::string& name : EnumRegistrySubKeys(GetCopiesRootKey())) {
    if (IsCopyKey(name)) {
      CORXCopy copy(name);
      copy.Generation = GetCopyGeneration();
      copy.Collect();
      Copies.push_back(std::move(copy));
    }
  }
  return 0;
}

void CORXProductsList::Clear() { Copies.clear(); }

int32_t CORXProductsList::Print() {
  if (GetCopyGeneration() == 0) {
    PrintBeforeV9();
  } else {
    PrintSinceV9();
  }
  return 0;
}

static void PrintBox(const char* title) {
  CLogger& log = CLogger::GetInstance();
  const std::string stars(93, '*');
  log << std::endl;
  log << stars << std::endl;
  log << title << std::endl;
  log << stars << std::endl;
}

void CORXProductsList::PrintBeforeV9() const {
  PrintBox(
      "*  PART A --ORX Installed Copies Information -- Prior to V9                                 "
      "*");
  if (Copies.empty()) {
    CLogger::GetInstance() << "There is no ORX prior to V9 Installed " << std::endl;
  }
  for (const CORXCopy& copy : Copies) {
    copy.Print();
  }
}

void CORXProductsList::PrintSinceV9() const {
  CLogger& log = CLogger::GetInstance();
  PrintBox(
      "*  PART B --ORX Installed Copies Information -- V9 & Later                                  "
      "*");
  log << std::endl;
  log << "Total ORX Copies:" << Copies.size() << std::endl;
  if (Copies.empty()) {
    log << std::endl;
    log << "There is no ORX V9 & later installed " << std::endl;
    return;
  }
  const std::string rule(45, '-');
  log << rule << std::endl;
  log << "ORX Copy Name" << std::endl;
  log << rule << std::endl;
  for (const CORXCopy& copy : Copies) {
    log << copy.Name << std::endl;
  }
  log << rule << std::endl;
  for (const CORXCopy& copy : Copies) {
    copy.Print();
  }
}
