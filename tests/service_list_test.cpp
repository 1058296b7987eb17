#include "inventory/service_list.h"

#include <gtest/gtest.h>

#include "tests/fake_machine.h"

namespace {

TEST(ServiceList, TellsEveryStateInWords) {
  const char* const words[] = {"Uknown",
                               "Stopped",
                               "Is starting",
                               "Is stopping",
                               "Started",
                               "The service continue is pending",
                               "The service pause is pending",
                               "Paused",
                               "Uknown"};
  Machine() = FakeMachine();
  for (uint32_t state = 0; state < std::size(words); ++state) {
    Machine().Services.Entries.push_back({std::to_string(state), "shown", state});
  }
  CServicesList list;
  EXPECT_EQ(list.Collect(), 0);
  ASSERT_EQ(list.Services.size(), std::size(words));
  for (size_t state = 0; state < std::size(words); ++state) {
    EXPECT_EQ(list.Services[state].ServiceName, std::to_string(state));
    EXPECT_EQ(list.Services[state].Status, words[state]);
  }

  Machine().Services = {5, {}};  // the next listing is refused
  EXPECT_EQ(list.Collect(), 5);
  EXPECT_TRUE(list.Services.empty());
}

TEST(ServiceList, FiltersByTheDisplayNameAlone) {
  const std::pair<CServiceInfo, bool> cases[] = {{{"a", "The ORX Server", ""}, true},
                                                 {{"a", "Windows Installer", ""}, true},
                                                 {{"ORX", "orx server", ""}, false},
                                                 {{"a", "windows installer", ""}, false},
                                                 {{"a", "Windows Updater", ""}, false}};
  const CServicesList list;
  for (const auto& [service, isPrinted] : cases) {
    EXPECT_EQ(list.Matches(service), isPrinted) << service.DisplayName;
  }
}

}  // namespace
