#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "products/parameter.h"

// What the registry holds of one installed copy of the product family. Every record owns all that
// is in it and knows its copy by name alone. Each Collect fills a new record under the copy
// generation in force (products/copy_generation.h); what the registry lacks stays empty.
// (products/copy_collection.cpp; the report is in products/copy_report.cpp)

struct CORXVersion {
  std::string Version;
  std::string Release;
  std::string Modification;
  std::string ServiceLevel;
};

struct CORXProduct {
  CORXProduct(const std::string& copyName, const std::string& name);
  void Collect();

  std::string Name;  // of the product's key, its leading "ORX " included
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

  // Writes the copy's block to the CLogger stream. Fields are padded as the stream's adjustment
  // says, which the report leaves alone.
  void Print() const;
  void PrintGlobalProfiles() const;
  void PrintProducts() const;
  void PrintInstances() const;

  std::vector<CParameter> GlobalProfile;
  std::vector<CORXInstance> Instances;
  CORXVersion VersionInfo;  // collected, not part of the report
  std::vector<CADMInstance> AdmInstances;
  std::vector<CORXProduct> Products;
  int32_t Generation = 0;  // the copy generation that the record was filled under
  std::string Name;
};
