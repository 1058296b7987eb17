#include <utility>

#include "platform/registry.h"
#include "products/copy_generation.h"
#include "products/copy_records.h"
#include "products/registry_value.h"

namespace {

std::string CopyKey(const std::string& copyName) { return GetCopiesRootKey() + "\\" + copyName; }

CORXVersion ReadVersion(const std::string& keyPath) {
  CORXVersion version;
  version.Version = ReadRegistryValue(keyPath, "Version");
  version.Release = ReadRegistryValue(keyPath, "Release");
  version.Modification = ReadRegistryValue(keyPath, "Modification");
  version.ServiceLevel = ReadRegistryValue(keyPath, "Service Level");
  return version;
}

template <typename Instance>
void AppendInstances(const std::string& copyName, const std::string& keyPath,
                     std::vector<Instance>& instances) {
  for (const std::string& name : EnumRegistrySubKeys(keyPath)) {
    Instance instance(copyName, name);
    instance.Collect();
    instances.push_back(std::move(instance));
  }
}

}  // namespace

CORXProduct::CORXProduct(const std::string& copyName, const std::string& name)
    : Name(name), CopyName(copyName) {}

void CORXProduct::Collect() {
  const std::string keyPath = CopyKey(CopyName) + "\\" + Name + "\\CurrentVersion";
  VersionInfo = ReadVersion(keyPath);
  ProductCode = ReadRegistryValue(keyPath, "ProductCode");
  LastModifiedDate = ReadRegistryValue(keyPath, "Last Modified Date");
  Description = ReadRegistryValue(keyPath, "Description");
  Title = ReadRegistryValue(keyPath, "Title");
}

CORXInstance::CORXInstance(const std::string& copyName, const std::string& name)
    : CopyName(copyName), Name(name) {}

void CORXInstance::Collect() {
  AppendParameters(CopyKey(CopyName) + "\\PROFILES\\" + Name, Parameters);
}

CADMInstance::CADMInstance(const std::string& copyName, const std::string& name)
    : CopyName(copyName), Name(name) {}

void CADMInstance::Collect() {
  AppendParameters(CopyKey(CopyName) + "\\ADM_PROFILES\\" + Name, Parameters);
}

CORXCopy::CORXCopy(const std::string& name) : Name(name) {}

void CORXCopy::Collect() {
  CollectGlobalProfile();
  CollectInstances();
  CollectAdmInstances();
  VersionInfo = ReadVersion(CopyKey(Name) + "\\CurrentVersion");
  for (const std::string& key : EnumRegistrySubKeys(CopyKey(Name))) {
    if (IsProductKey(key)) {
      CORXProduct product(Name, key);
      product.Collect();
      AddProduct(product);
    }
  }
}

void CORXCopy::CollectGlobalProfile() {
  AppendParameters(CopyKey(Name) + "\\GLOBAL_PROFILE", GlobalProfile);
}

void CORXCopy::CollectInstances() {
  AppendInstances(Name, CopyKey(Name) + "\\PROFILES", Instances);
}

void CORXCopy::CollectAdmInstances() {
  AppendInstances(Name, CopyKey(Name) + "\\ADM_PROFILES", AdmInstances);
}

void CORXCopy::AddProduct(const CORXProduct& product) { Products.push_back(product); }
