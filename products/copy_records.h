#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "products/parameter.h"

// What the registry has about one installed copy of the product family. A record owns its contents
// and refers to its copy by name. Each Collect fills a new record from the layout that
// products/copy_generation.h selects; what the registry does not have stays empty.
// products/copy_collection.cpp implements it, products/copy_report.cpp the report.

struct CORXVersion {
  std::string Version;
  std::string Release;
  std::string Modification;
  std::string ServiceLevel;
};

struct CORXProduct {
  CORXProduct(const std::string& copyName, const std::string& name);
  void Collect();

  std::string Name;  // of the product's key, with its leading "ORX "
  std::string CopyName;
  std::string Description;  // collected, not part of the report
  std::string LastModifiedDate;
  std::string Title;  // collected, not part of the report
  std::string ProductCode;
  CORXVersion VersionInfo;
};

struct CORXInstance {
  CORXInstance(const std::string& copyName, const std::string& name);
  void Collect();

  std::string CopyName;
  std::string Name;
  std::vector<CParameter> Parameters;
};

// An administrative profile; not part of the report.
struct CADMInstance {
  CADMInstance(const std::string& copyName, const std::string& name);
  void Collect();

  std::string CopyName;
  std::string Name;
  std::vector<CParameter> Parameters;
};

struct CORXCopy {
  explicit CORXCopy(const std::string& name);

  void Collect();
  void CollectGlobalProfile();
  void CollectInstances();
  void CollectAdmInstances();
  void AddProduct(const CORXProduct& product);

  // Writes the copy's block to the CLogger stream. The stream's adjustment decides on which side
  // fields are padded.
  void Print() const;
  void PrintGlobalProfiles() const;
  void PrintProducts() const;
  void PrintInstances() const;

  std::vector<CParameter> GlobalProfile;
  std::vector<CORXInstance> Instances;
  CORXVersion VersionInfo;  // collected, not part of the report
  std::vector<CADMInstance> AdmInstances;
  std::vector<CORXProduct> Products;
  int32_t Generation = 0;  // the copy generation at the time of Collect
  std::string Name;
};
