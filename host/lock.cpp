// SPDX-License-Identifier: Apache-2.0
// The default locks: POSIX mutexes inside the caller's HSV1_Lock.
#include <lexaro/host.h>
#include <pthread.h>

#include <cerrno>
#include <new>

namespace lx {
namespace {

static_assert(sizeof(pthread_mutex_t) <= sizeof(HSV1_Lock));
static_assert(alignof(pthread_mutex_t) <= alignof(HSV1_Lock));

pthread_mutex_t* mutex_of(HSV1_Lock* lock) { return std::launder(reinterpret_cast<pthread_mutex_t*>(lock)); }

// An error-checking mutex: taking it twice, or releasing what another thread holds, is reported instead of a hang.
int make_mutex(pthread_mutex_t* mutex) {
  pthread_mutexattr_t attributes;
  if (const int failure = pthread_mutexattr_init(&attributes); failure != 0) return failure;
  int failure = pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_ERRORCHECK);
  if (failure == 0) failure = pthread_mutex_init(mutex, &attributes);
  pthread_mutexattr_destroy(&attributes);
  return failure;
}

}  // namespace
}  // namespace lx

[[gnu::weak]] int32_t HSV1_InitializeLock(HSV1_Lock* lock) noexcept {
  if (lock == nullptr) return EINVAL;
  return lx::make_mutex(::new (static_cast<void*>(lock)) pthread_mutex_t);
}

[[gnu::weak]] int32_t HSV1_GetLock(HSV1_Lock* lock) noexcept { return pthread_mutex_lock(lx::mutex_of(lock)); }

[[gnu::weak]] int32_t HSV1_ReleaseLock(HSV1_Lock* lock) noexcept { return pthread_mutex_unlock(lx::mutex_of(lock)); }

[[gnu::weak]] int32_t HSV1_DestroyLock(HSV1_Lock* lock) noexcept { return pthread_mutex_destroy(lx::mutex_of(lock)); }
