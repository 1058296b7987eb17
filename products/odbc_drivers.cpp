#include "products/odbc_drivers.h"

#include <iomanip>
#include <utility>

#include "eventlog/logger.h"
#include "platform/registry.h"

CODBCDriver::CODBCDriver(const std::string& name) : Name(name) {}

void CODBCDriver::Collect() {
  AppendParameters("SOFTWARE\\ODBC\\ODBCINST.INI\\" + Name, Parameters);
}

void CODBCDriversList::Collect() {
  for (const std::string& name :
       EnumRegistryValueNames("SOFTWARE\\ODBC\\ODBCINST.INI\\ODBC Drivers")) {
    if (name.find("ZEK ORX") != std::string::npos) {
      CODBCDriver driver(name);
      driver.Collect();
      Drivers.push_back(std::move(driver));
    }
  }
}

static void PrintDriver(const CODBCDriver& driver) {
  CLogger& log = CLogger::GetInstance();
  const std::string rule(76, '-');
  log << "ODBC Driver:" << driver.Name << std::endl;
  log << rule << std::endl;
  log << "Parameter Name                Value                " << std::endl;
  log << rule << std::endl;
  for (const CParameter& parameter : driver.Parameters) {
    log << std::setw(30) << parameter.Name << parameter.Value << std::endl;
  }
  log << rule << std::endl;
}

void CODBCDriversList::Print() {
  CLogger& log = CLogger::GetInstance();
  log << std::endl;
  log << "Total ORX ODBC Drivers:" << Drivers.size() << std::endl;
  if (Drivers.empty()) {
    log << " ******** There is no ORX ODBC Driver Installed *********" << std::endl;
    return;
  }
  const std::string rule(43, '-');
  log << rule << std::endl;
  log << "Driver Name" << std::endl;
  log << rule << std::endl;
  for (const CODBCDriver& driver : Drivers) {
    log << driver.Name << std::endl;
  }
  log << rule << std::endl;
  log << std::endl;
  for (const CODBCDriver& driver : Drivers) {
    PrintDriver(driver);
  }
}
