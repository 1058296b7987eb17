#include "platform/services.h"

#include <dlfcn.h>
#include <systemd/sd-bus.h>

#include <cerrno>
#include <chrono>
#include <memory>
#include <string_view>

namespace {

// The calls of libsystemd in use. They are looked up so that a run that lists no services does not
// load the library, and a machine without it has no services.
struct BusLibrary {
  decltype(&::sd_bus_open_system) OpenSystem = nullptr;
  decltype(&::sd_bus_call_method_async) CallMethodAsync = nullptr;
  decltype(&::sd_bus_process) Process = nullptr;
  decltype(&::sd_bus_wait) Wait = nullptr;
  decltype(&::sd_bus_close_unref) CloseUnref = nullptr;
  decltype(&::sd_bus_message_get_errno) GetErrno = nullptr;
  decltype(&::sd_bus_message_enter_container) EnterContainer = nullptr;
  decltype(&::sd_bus_message_read) Read = nullptr;

  bool Load();
};

template <typename Function>
bool LookUp(void* library, const char* name, Function& function) {
  function = reinterpret_cast<Function>(::dlsym(library, name));
  return function != nullptr;
}

bool BusLibrary::Load() {
  void* library = ::dlopen("libsystemd.so.0", RTLD_NOW | RTLD_LOCAL);
  return library != nullptr && LookUp(library, "sd_bus_open_system", OpenSystem) &&
         LookUp(library, "sd_bus_call_method_async", CallMethodAsync) &&
         LookUp(library, "sd_bus_process", Process) && LookUp(library, "sd_bus_wait", Wait) &&
         LookUp(library, "sd_bus_close_unref", CloseUnref) &&
         LookUp(library, "sd_bus_message_get_errno", GetErrno) &&
         LookUp(library, "sd_bus_message_enter_container", EnterContainer) &&
         LookUp(library, "sd_bus_message_read", Read);
}

uint32_t StateNumber(std::string_view activeState) {
  constexpr std::pair<std::string_view, uint32_t> states[] = {
      {"inactive", 1},     {"failed", 1}, {"activating", 2},
      {"deactivating", 3}, {"active", 4}, {"reloading", 5},
  };
  for (const auto& [name, number] : states) {
    if (name == activeState) {
      return number;
    }
  }
  return 0;
}

using Clock = std::chrono::steady_clock;

// One query for the units of systemd. Each step returns 0 or more, or a negative error number.
class UnitQuery {
 public:
  UnitQuery(const BusLibrary& library, std::chrono::milliseconds limit)
      : Library(library), Deadline(Clock::now() + limit) {}
  ~UnitQuery() { Library.CloseUnref(Bus); }
  UnitQuery(const UnitQuery&) = delete;
  UnitQuery& operator=(const UnitQuery&) = delete;

  int Send();
  int AwaitReply();

  std::vector<ServiceEntry> Entries;

 private:
  static int TakeReply(sd_bus_message* reply, void* query, sd_bus_error*);
  int ReadUnits(sd_bus_message* reply);

  const BusLibrary& Library;
  const Clock::time_point Deadline;
  sd_bus* Bus = nullptr;
  bool IsAnswered = false;
  int Outcome = 0;
};

int UnitQuery::Send() {
  int opened = 0;
  do {
    opened = Library.OpenSystem(&Bus);
  } while (opened == -EINTR);
  if (opened < 0) {
    return opened;
  }
  // The call is queued after the authentication, which goes on while the reply is awaited: so one
  // deadline is enough. The library's own blocking call waits for the authentication without one.
  return Library.CallMethodAsync(Bus, /*slot=*/nullptr, "org.freedesktop.systemd1",
                                 "/org/freedesktop/systemd1", "org.freedesktop.systemd1.Manager",
                                 "ListUnits", &UnitQuery::TakeReply, this, /*types=*/"");
}

int UnitQuery::AwaitReply() {
  while (!IsAnswered) {
    const int64_t left =
        std::chrono::duration_cast<std::chrono::microseconds>(Deadline - Clock::now()).count();
    if (left <= 0) {
      return -ETIMEDOUT;
    }
    int step = Library.Process(Bus, /*message=*/nullptr);
    if (step == 0) {  // nothing to process yet
      step = Library.Wait(Bus, static_cast<uint64_t>(left));
    }
    if (step < 0 && step != -EINTR) {
      return step;
    }
  }
  return Outcome;
}

int UnitQuery::TakeReply(sd_bus_message* reply, void* query, sd_bus_error*) {
  auto* self = static_cast<UnitQuery*>(query);
  self->Outcome = self->ReadUnits(reply);
  self->IsAnswered = true;
  return 0;
}

int UnitQuery::ReadUnits(sd_bus_message* reply) {
  if (const int refusal = Library.GetErrno(reply); refusal > 0) {
    return -refusal;
  }
  const int entered = Library.EnterContainer(reply, 'a', "(ssssssouso)");
  if (entered < 0) {
    return entered;
  }
  const char* name = nullptr;
  const char* description = nullptr;
  const char* loadState = nullptr;
  const char* activeState = nullptr;
  int isRead = 0;
  while ((isRead = Library.Read(reply, "(ssssssouso)", &name, &description, &loadState,
                                &activeState, /*sub*/ nullptr, /*following*/ nullptr,
                                /*path*/ nullptr, /*job id*/ nullptr, /*job type*/ nullptr,
                                /*job path*/ nullptr)) > 0) {
    // Other units may name a service that is not installed.
    const bool isInstalled = std::string_view(loadState) != "not-found";
    if (isInstalled && std::string_view(name).ends_with(".service")) {
      Entries.push_back({name, description, StateNumber(activeState)});
    }
  }
  return isRead;
}

}  // namespace

ServiceListing ListServices(std::chrono::milliseconds limit) {
  BusLibrary library;
  if (!library.Load()) {
    return {ELIBACC, {}};
  }
  UnitQuery query(library, limit);
  int outcome = query.Send();
  if (outcome >= 0) {
    outcome = query.AwaitReply();
  }
  if (outcome < 0) {
    return {static_cast<uint32_t>(-outcome), {}};
  }
  return {0, std::move(query.Entries)};
}
