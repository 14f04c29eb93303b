// SPDX-License-Identifier: Apache-2.0
// The default storage of processes and threads: blocks from the system allocator, made on first use.
#include <lexaro/host.h>
#include <pthread.h>

#include <cstddef>
#include <cstdlib>

namespace lx {
namespace {

pthread_once_t g_once = PTHREAD_ONCE_INIT;
pthread_mutex_t g_mutex;  // guards the first use of a descriptor

// Recursive, since the initialisation of one block may resolve another.
void make_mutex() {
  pthread_mutexattr_t attributes;
  pthread_mutexattr_init(&attributes);
  pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
  pthread_mutex_init(&g_mutex, &attributes);
  pthread_mutexattr_destroy(&attributes);
}

class FirstUse {
 public:
  FirstUse() {
    pthread_once(&g_once, make_mutex);
    pthread_mutex_lock(&g_mutex);
  }
  ~FirstUse() { pthread_mutex_unlock(&g_mutex); }
  FirstUse(const FirstUse&) = delete;
  FirstUse& operator=(const FirstUse&) = delete;
};

void trace(int32_t line, const char* event, const char* source) {
  static TRC1_Unit unit{"Lexaro", "host", 0};
  TRC1_Sync(&unit);
  if ((__atomic_load_n(&unit.flags, __ATOMIC_RELAXED) & TRC1_LEVEL_INIT) == 0) return;
  TRC1_Printf(&unit, line, "%s for %s", event, source == nullptr ? "an unnamed caller" : source);
}

// What the host field of a descriptor returns once another thread may have set it, made by `make` on first use.
template <typename Make>
void* made_once(HSV1_Descriptor* descriptor, Make make) {
  if (void* made = __atomic_load_n(&descriptor->host, __ATOMIC_ACQUIRE); made != nullptr) return made;
  const FirstUse guard;
  void* made = __atomic_load_n(&descriptor->host, __ATOMIC_RELAXED);
  if (made == nullptr) {
    made = make();
    __atomic_store_n(&descriptor->host, made, __ATOMIC_RELEASE);
  }
  return made;
}

void* make_process_block(const HSV1_Descriptor* descriptor, const char* source) {
  void* block = std::calloc(1, descriptor->size == 0 ? 1 : descriptor->size);
  if (block == nullptr) return nullptr;
  trace(__LINE__, "process block made", source);
  if (descriptor->init != nullptr) descriptor->init(block);
  return block;
}

// The host field of a thread descriptor points to its slot; a thread's value for the key is a header before the block.
struct ThreadSlot {
  pthread_key_t key;
  const HSV1_Descriptor* descriptor;
};

struct alignas(std::max_align_t) ThreadHeader {
  const ThreadSlot* slot;
  void* block() { return this + 1; }
};

void end_thread_block(void* value) {
  auto* header = static_cast<ThreadHeader*>(value);
  const ThreadSlot* slot = header->slot;
  trace(__LINE__, "thread block ended", "the thread");
  if (slot->descriptor->term != nullptr) {
    pthread_setspecific(slot->key, header);  // term may resolve its own block
    slot->descriptor->term(header->block());
    pthread_setspecific(slot->key, nullptr);
  }
  std::free(header);
}

void* make_thread_slot(const HSV1_Descriptor* descriptor) {
  auto* slot = static_cast<ThreadSlot*>(std::malloc(sizeof(ThreadSlot)));
  if (slot == nullptr) return nullptr;
  if (pthread_key_create(&slot->key, end_thread_block) != 0) {
    std::free(slot);
    return nullptr;
  }
  slot->descriptor = descriptor;
  return slot;
}

void* make_thread_block(const ThreadSlot* slot, const char* source) {
  const size_t size = slot->descriptor->size;
  if (size > SIZE_MAX - sizeof(ThreadHeader)) return nullptr;
  auto* header = static_cast<ThreadHeader*>(std::calloc(1, sizeof(ThreadHeader) + size));
  if (header == nullptr) return nullptr;
  header->slot = slot;
  if (pthread_setspecific(slot->key, header) != 0) {
    std::free(header);
    return nullptr;
  }
  trace(__LINE__, "thread block made", source);
  if (slot->descriptor->init != nullptr) slot->descriptor->init(header->block());
  return header->block();
}

}  // namespace
}  // namespace lx

[[gnu::weak]] void* HSV1_ResolveProcess(HSV1_Descriptor* descriptor, const char* source) noexcept {
  return lx::made_once(descriptor, [&] { return lx::make_process_block(descriptor, source); });
}

[[gnu::weak]] void* HSV1_ResolveThread(HSV1_Descriptor* descriptor, const char* source) noexcept {
  const void* made = lx::made_once(descriptor, [&] { return lx::make_thread_slot(descriptor); });
  if (made == nullptr) return nullptr;
  const auto* slot = static_cast<const lx::ThreadSlot*>(made);
  auto* header = static_cast<lx::ThreadHeader*>(pthread_getspecific(slot->key));
  return header != nullptr ? header->block() : lx::make_thread_block(slot, source);
}
