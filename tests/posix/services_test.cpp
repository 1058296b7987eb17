// The services of a machine whose system bus is a private one, with a stand-in for systemd on it.

#include "platform/services.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <poll.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <systemd/sd-bus.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <functional>

namespace {

// A process of the test's, ended with the object at the latest.
class Child {
 public:
  explicit Child(const std::function<void()>& run) : Process(::fork()) {
    if (Process == 0) {
      ::prctl(PR_SET_PDEATHSIG, SIGKILL);
      run();
      ::_exit(1);
    }
  }
  ~Child() {
    ::kill(Process, SIGKILL);
    ::waitpid(Process, /*status=*/nullptr, /*options=*/0);
  }
  Child(const Child&) = delete;
  Child& operator=(const Child&) = delete;

 private:
  pid_t Process;
};

enum class Manner { kUnits, kOtherShape, kRefusal, kSilence };

int AppendUnit(sd_bus_message* reply, const char* name, const char* description,
               const char* loadState, const char* activeState) {
  return sd_bus_message_append(reply, "(ssssssouso)", name, description, loadState, activeState,
                               "sub", "", "/unit", 0U, "", "/job");
}

void ReplyWithUnits(sd_bus_message* call) {
  sd_bus_message* reply = nullptr;
  sd_bus_message_new_method_return(call, &reply);
  sd_bus_message_open_container(reply, 'a', "(ssssssouso)");
  AppendUnit(reply, "zeta.service", "ORX Server", "loaded", "active");
  AppendUnit(reply, "a.socket", "No service", "loaded", "active");
  AppendUnit(reply, "off.service", "", "loaded", "inactive");
  AppendUnit(reply, "gone.service", "gone.service", "not-found", "inactive");
  AppendUnit(reply, "failed.service", "Fehlgeschlagen für heute", "loaded", "failed");
  AppendUnit(reply, "up@1.service", "Coming up", "loaded", "activating");
  AppendUnit(reply, "down.service", "Going down", "loaded", "deactivating");
  AppendUnit(reply, "again.service", "Once more", "loaded", "reloading");
  AppendUnit(reply, "odd.service", "Odd", "loaded", "maintenance");
  AppendUnit(reply, "a.service.mount", "No service", "loaded", "active");
  sd_bus_message_close_container(reply);
  sd_bus_message_send(reply);
  sd_bus_message_unref(reply);
}

int AnswerCall(sd_bus_message* call, void* manner, sd_bus_error*) {
  if (sd_bus_message_is_method_call(call, "org.freedesktop.systemd1.Manager", "ListUnits") <= 0) {
    return 0;
  }
  switch (*static_cast<const Manner*>(manner)) {
    case Manner::kUnits:
      ReplyWithUnits(call);
      break;
    case Manner::kOtherShape:
      sd_bus_reply_method_return(call, "s", "no list");
      break;
    case Manner::kRefusal:
      sd_bus_reply_method_errnof(call, EACCES, "not for you");
      break;
    case Manner::kSilence:
      break;
  }
  return 1;
}

void RunServiceManager(const std::string& address, Manner manner, int ready) {
  sd_bus* bus = nullptr;
  sd_bus_new(&bus);
  sd_bus_set_address(bus, address.c_str());
  sd_bus_set_bus_client(bus, 1);
  sd_bus_start(bus);
  sd_bus_add_object(bus, /*slot=*/nullptr, "/org/freedesktop/systemd1", &AnswerCall, &manner);
  if (sd_bus_request_name(bus, "org.freedesktop.systemd1", /*flags=*/0) < 0) {
    return;
  }
  [[maybe_unused]] const ssize_t told = ::write(ready, "R", 1);
  while (sd_bus_process(bus, /*message=*/nullptr) >= 0) {
    sd_bus_wait(bus, UINT64_MAX);
  }
}

class Services : public testing::Test {
 protected:
  void SetUp() override {
    char name[] = "/tmp/orx-bus-XXXXXX";
    ASSERT_NE(::mkdtemp(name), nullptr);
    Folder = name;
    Address = "unix:path=" + Folder + "/bus";
    ::setenv("DBUS_SYSTEM_BUS_ADDRESS", Address.c_str(), /*overwrite=*/1);
    ASSERT_EQ(::pipe2(Ready, O_CLOEXEC), 0);
  }
  void TearDown() override {
    ::close(Ready[0]);
    ::close(Ready[1]);
    std::filesystem::remove_all(Folder);
  }

  void RunBus() const {
    const std::string file = Folder + "/bus.conf";
    std::ofstream(file) << "<busconfig><listen>" << Address << "</listen><auth>EXTERNAL</auth>"
                        << "<policy context=\"default\"><allow send_destination=\"*\"/>"
                        << "<allow receive_sender=\"*\"/>"
                        << "<allow own=\"*\"/></policy></busconfig>";
    ::dup2(Ready[1], STDOUT_FILENO);
    ::execlp("dbus-daemon", "dbus-daemon", ("--config-file=" + file).c_str(), "--nofork",
             "--nopidfile", "--print-address", nullptr);
  }

  // True once the last started child has said that it is there; false if it does not do so soon.
  bool AwaitReady() const {
    pollfd ready = {Ready[0], POLLIN, 0};
    char text[256];
    return ::poll(&ready, /*count=*/1, /*milliseconds=*/10'000) == 1 &&
           ::read(Ready[0], text, sizeof text) > 0;
  }

  // A socket under the bus's name that nobody serves.
  int ListenOnly(int backlog) const {
    const int listener = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    (Folder + "/bus").copy(address.sun_path, sizeof address.sun_path - 1);
    const auto* name = reinterpret_cast<const sockaddr*>(&address);
    EXPECT_EQ(::bind(listener, name, sizeof address), 0);
    EXPECT_EQ(::listen(listener, backlog), 0);
    return listener;
  }

  static void ExpectTimeOut() {
    using Clock = std::chrono::steady_clock;
    const Clock::time_point begin = Clock::now();
    const ServiceListing listing = ListServices();
    const std::chrono::duration<double> taken = Clock::now() - begin;
    EXPECT_EQ(listing.Error, uint32_t{ETIMEDOUT});
    EXPECT_TRUE(listing.Entries.empty());
    EXPECT_GT(taken.count(), 1.9);
    EXPECT_LT(taken.count(), 2.5);
  }

  std::string Folder;
  std::string Address;
  int Ready[2] = {-1, -1};
};

TEST_F(Services, AreTheServiceUnitsInTheBussOrder) {
  const Child bus([this] { RunBus(); });
  ASSERT_TRUE(AwaitReady());
  const Child manager([this] { RunServiceManager(Address, Manner::kUnits, Ready[1]); });
  ASSERT_TRUE(AwaitReady());
  const ServiceListing listing = ListServices();
  EXPECT_EQ(listing.Error, 0U);
  std::string text;
  for (const ServiceEntry& entry : listing.Entries) {
    text += entry.ServiceName + '|' + entry.DisplayName + '|' + std::to_string(entry.CurrentState) +
            '\n';
  }
  EXPECT_EQ(text,
            "zeta.service|ORX Server|4\n"
            "off.service||1\n"
            "gone.service|gone.service|1\n"
            "failed.service|Fehlgeschlagen für heute|1\n"
            "up@1.service|Coming up|2\n"
            "down.service|Going down|3\n"
            "again.service|Once more|5\n"
            "odd.service|Odd|0\n");
}

TEST_F(Services, AreMissingWhereTheAnswerIsNone) {
  EXPECT_EQ(ListServices().Error, uint32_t{ENOENT});  // no bus

  const Child bus([this] { RunBus(); });
  ASSERT_TRUE(AwaitReady());
  EXPECT_NE(ListServices().Error, 0U);  // nobody of that name on it

  const std::pair<Manner, uint32_t> cases[] = {{Manner::kOtherShape, ENXIO},
                                               {Manner::kRefusal, EACCES}};
  for (const auto& [manner, error] : cases) {
    const Child manager([this, chosen = manner] { RunServiceManager(Address, chosen, Ready[1]); });
    ASSERT_TRUE(AwaitReady());
    const ServiceListing listing = ListServices();
    EXPECT_EQ(listing.Error, error);
    EXPECT_TRUE(listing.Entries.empty());
  }
}

TEST_F(Services, AreNotWaitedForBehindASilentManager) {
  const Child bus([this] { RunBus(); });
  ASSERT_TRUE(AwaitReady());
  const Child manager([this] { RunServiceManager(Address, Manner::kSilence, Ready[1]); });
  ASSERT_TRUE(AwaitReady());
  ExpectTimeOut();
}

TEST_F(Services, AreNotWaitedForBehindASocketThatNeverAnswers) {
  const int listener = ListenOnly(/*backlog=*/8);
  ExpectTimeOut();
  ::close(listener);
}

TEST_F(Services, AreNotWaitedForBehindABusThatAnswersByteByByte) {
  const int listener = ListenOnly(/*backlog=*/8);
  const Child bus([listener] {
    const int client = ::accept(listener, /*address=*/nullptr, /*length=*/nullptr);
    while (::write(client, "O", 1) == 1) {
      ::usleep(100'000);
    }
  });
  ExpectTimeOut();
  ::close(listener);
}

}  // namespace
