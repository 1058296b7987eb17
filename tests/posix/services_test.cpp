// The services that are listed from a fake system bus with a fake service manager.

#include "platform/services.h"

#include <gtest/gtest.h>
#include <sys/prctl.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <systemd/sd-bus.h>
#include <unistd.h>

#include <chrono>
#include <csignal>
#include <cstddef>
#include <functional>

namespace {

// The listing while another process serves the system bus.
ServiceListing ListFrom(const std::function<void(int client)>& serve,
                        std::chrono::milliseconds limit = std::chrono::seconds(10)) {
  const std::string name = "orx-bus-" + std::to_string(::getpid());
  ::setenv("DBUS_SYSTEM_BUS_ADDRESS", ("unix:abstract=" + name).c_str(), /*overwrite=*/1);
  sockaddr_un address = {AF_UNIX, ""};
  name.copy(address.sun_path + 1, name.size());
  const size_t size = offsetof(sockaddr_un, sun_path) + 1 + name.size();
  const int listener = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
  ::bind(listener, reinterpret_cast<const sockaddr*>(&address), static_cast<socklen_t>(size));
  EXPECT_EQ(::listen(listener, /*backlog=*/1), 0);
  const pid_t server = ::fork();
  if (server == 0) {
    ::prctl(PR_SET_PDEATHSIG, SIGKILL);
    serve(::accept(listener, /*address=*/nullptr, /*length=*/nullptr));
    ::_exit(1);
  }
  ::close(listener);
  ServiceListing listing = ListServices(limit);
  ::kill(server, SIGKILL);
  ::waitpid(server, /*status=*/nullptr, /*options=*/0);
  return listing;
}

// How the manager replies to the query for its units.
using Answer = int (*)(sd_bus_message* query);

int AnswerCall(sd_bus_message* call, void* answer, sd_bus_error*) {
  if (sd_bus_message_is_method_call(call, "org.freedesktop.DBus", "Hello") > 0) {
    return sd_bus_reply_method_return(call, "s", ":1.1");
  }
  const char* manager = "org.freedesktop.systemd1.Manager";
  const bool isQuery = sd_bus_message_is_method_call(call, manager, "ListUnits") > 0;
  return isQuery ? (*static_cast<const Answer*>(answer))(call) : 0;
}

std::function<void(int)> Manager(Answer answer) {
  return [answer](int client) mutable {
    sd_bus* bus = nullptr;
    sd_bus_new(&bus);
    sd_bus_set_fd(bus, client, client);
    sd_bus_set_server(bus, /*b=*/1, /*bus_id=*/{});
    sd_bus_add_filter(bus, /*slot=*/nullptr, &AnswerCall, &answer);
    sd_bus_start(bus);
    while (sd_bus_process(bus, /*message=*/nullptr) >= 0) {
      sd_bus_wait(bus, UINT64_MAX);
    }
  };
}

int ListUnits(sd_bus_message* query) {
  const char* const units[][4] = {{"zeta.service", "ORX Server", "loaded", "active"},
                                  {"a.socket", "No service", "loaded", "active"},
                                  {"off.service", "", "loaded", "inactive"},
                                  {"failed.service", "Fehlgeschlagen für heute", "error", "failed"},
                                  {"missing.service", "missing.service", "not-found", "inactive"},
                                  {"up@1.service", "Coming up", "loaded", "activating"},
                                  {"down.service", "Going down", "masked", "deactivating"},
                                  {"again.service", "Once more", "loaded", "reloading"},
                                  {"odd.service", "Odd", "loaded", "maintenance"},
                                  {"a.service.mount", "No service", "loaded", "active"}};
  sd_bus_message* reply = nullptr;
  sd_bus_message_new_method_return(query, &reply);
  sd_bus_message_open_container(reply, 'a', "(ssssssouso)");
  for (const auto& [name, description, load, state] : units) {
    sd_bus_message_append(reply, "(ssssssouso)", name, description, load, state, "sub", "", "/unit",
                          0U, "", "/job");
  }
  sd_bus_message_close_container(reply);
  return sd_bus_send(/*bus=*/nullptr, reply, /*cookie=*/nullptr);
}

TEST(Services, AreTheInstalledServiceUnitsInTheOrderOfTheBus) {
  const ServiceListing listing = ListFrom(Manager(&ListUnits));
  EXPECT_EQ(listing.Error, 0U);
  std::string text;
  for (const auto& [name, displayName, state] : listing.Entries) {
    text += name + '|' + displayName + '|' + std::to_string(state) + ' ';
  }
  EXPECT_EQ(text,
            "zeta.service|ORX Server|4 off.service||1 failed.service|Fehlgeschlagen für heute|1 "
            "up@1.service|Coming up|2 down.service|Going down|3 again.service|Once more|5 "
            "odd.service|Odd|0 ");
}

TEST(Services, ReturnTheErrorOfAFailedQuery) {
  ::setenv("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=/no/bus", /*overwrite=*/1);
  EXPECT_EQ(ListServices(std::chrono::seconds(1)).Error, uint32_t{ENOENT});
  const std::pair<Answer, uint32_t> cases[] = {
      {[](sd_bus_message* call) { return sd_bus_reply_method_return(call, "s", "no"); }, ENXIO},
      {[](sd_bus_message* call) { return sd_bus_reply_method_errnof(call, EACCES, "no"); }, EACCES},
  };
  for (const auto& [answer, error] : cases) {
    EXPECT_EQ(ListFrom(Manager(answer)).Error, error);
  }
}

TEST(Services, AreNotAwaitedAfterTheLimit) {
  const auto endless = [](int client) {
    while (::write(client, "O", 1) == 1) {
      ::usleep(100'000);
    }
  };
  const std::function<void(int)> silentOnes[] = {Manager([](sd_bus_message*) { return 1; }),
                                                 [](int) { ::pause(); }, endless};
  std::signal(SIGALRM, [](int) {});
  for (const auto& serve : silentOnes) {
    ::ualarm(/*value=*/150'000, /*interval=*/20'000);
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_EQ(ListFrom(serve, std::chrono::milliseconds(200)).Error, uint32_t{ETIMEDOUT});
    const std::chrono::duration<double> seconds = std::chrono::steady_clock::now() - begin;
    EXPECT_TRUE(seconds.count() >= 0.2 && seconds.count() < 1) << seconds.count();
    ::ualarm(0, 0);
  }
}

}  // namespace
