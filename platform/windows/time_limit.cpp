#include "platform/windows/time_limit.h"

#include "platform/windows/system.h"

using Work = std::function<void()>;

static DWORD WINAPI RunWork(void* parameter) {
  const std::unique_ptr<Work> work(static_cast<Work*>(parameter));
  (*work)();
  return 0;
}

bool TimeLimit::Wait(std::function<void()> work) {
  if (Left <= Left.zero()) {
    return false;
  }
  const auto begin = std::chrono::steady_clock::now();
  auto owned = std::make_unique<Work>(std::move(work));
  const UniqueHandle thread(::CreateThread(/*lpThreadAttributes=*/nullptr, /*dwStackSize=*/0,
                                           &RunWork, owned.get(), /*dwCreationFlags=*/0,
                                           /*lpThreadId=*/nullptr));
  if (!thread) {
    return false;
  }
  owned.release();  // the thread's
  const DWORD result = ::WaitForSingleObject(thread.get(), static_cast<DWORD>(Left.count()));
  Left -= std::chrono::duration_cast<std::chrono::milliseconds>(std::chrono::steady_clock::now() -
                                                                begin);
  return result == WAIT_OBJECT_0;
}
