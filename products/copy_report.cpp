#include <iomanip>

#include "eventlog/logger.h"
#include "products/copy_generation.h"
#include "products/copy_records.h"

namespace {

void PrintProductRow(const CORXProduct& product) {
  const CORXVersion& version = product.VersionInfo;
  CLogger& log = CLogger::GetInstance();
  log << std::setw(40) << product.Name << std::setw(40) << product.ProductCode;
  // Joined first, so that the field width applies to the whole version.
  log << std::setw(10) << version.Version + '.' + version.Release + '.' + version.Modification;
  log << std::setw(20) << version.ServiceLevel << std::setw(20) << product.LastModifiedDate
      << std::endl;
}

void PrintInstance(const CORXInstance& instance) {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(68, '-');
  log << "ORX Instance Name:" << instance.Name << std::endl;
  log << rule << std::endl;
  log << "Parameter Name                      Value                  " << std::endl;
  log << rule << std::endl;
  for (const CParameter& parameter : instance.Parameters) {
    log << std::setw(36) << parameter.Name << parameter.Value << std::endl;
  }
  log << rule << std::endl;
  log << std::endl;
}

}  // namespace

void CORXCopy::Print() const {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(48, '-');
  log << std::endl;
  if (GetCopyGeneration() != 0) {
    log << "ORX Installation Copy Name:" << Name << std::endl;
  }
  log << rule << std::endl;
  log << "Total Products     :" << Products.size() << std::endl;
  log << "Total ORX Instances:" << Instances.size() << std::endl;
  log << rule << std::endl;
  PrintGlobalProfiles();
  PrintProducts();
  PrintInstances();
}

void CORXCopy::PrintGlobalProfiles() const {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(120, '-');
  log << std::endl;
  log << "Global Profiles:" << std::endl;
  log << rule << std::endl;
  for (const CParameter& parameter : GlobalProfile) {
    log << std::setw(30) << parameter.Name + ':' << parameter.Value << std::endl;
  }
  log << rule << std::endl;
}

void CORXCopy::PrintProducts() const {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(128, '-');
  log << std::endl;
  log << "ORX Products installed:" << std::endl;
  log << rule << std::endl;
  log << "Product Name                            Product Code                            "
         "Version   Service Level       Last Modified Date"
      << std::endl;
  log << rule << std::endl;
  for (const CORXProduct& product : Products) {
    PrintProductRow(product);
  }
  log << rule << std::endl;
}

void CORXCopy::PrintInstances() const {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(33, '-');
  log << std::endl;
  log << "ORX Instances:" << std::endl;
  log << rule << std::endl;
  log << "Instance Name                    " << std::endl;
  log << rule << std::endl;
  for (const CORXInstance& instance : Instances) {
    log << instance.Name << std::endl;
  }
  log << rule << std::endl;
  log << std::endl;
  for (const CORXInstance& instance : Instances) {
    PrintInstance(instance);
  }
}
