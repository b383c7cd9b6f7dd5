// Operating-system services over pthreads.
#include <cstdlib>
#include <cstring>

#include "frame/host.h"

int OSL1_InitializeLock(OSL1_Lock *l) { return pthread_mutex_init(&l->mutex, nullptr); }
int OSL1_GetLock(OSL1_Lock *l) { return pthread_mutex_lock(&l->mutex); }
int OSL1_ReleaseLock(OSL1_Lock *l) { return pthread_mutex_unlock(&l->mutex); }
int OSL1_DestroyLock(OSL1_Lock *l) { return pthread_mutex_destroy(&l->mutex); }
const char *OSL1_GetEnv(const char *name) { return std::getenv(name); }

namespace {

pthread_mutex_t g_resolve = PTHREAD_MUTEX_INITIALIZER;
// Process blocks whose finalisers run when the library is unloaded or the process ends.
constexpr int kMaxProcess = 4;
OSL1_Descriptor *g_process[kMaxProcess];
int g_processCount = 0;

__attribute__((destructor)) void finishProcesses() {
  for (int i = g_processCount; i-- > 0;) {
    OSL1_Descriptor *d = g_process[i];
    if (d->resolved && d->term) d->term(d->resolved);
    std::free(d->resolved);
    d->resolved = nullptr;
  }
  g_processCount = 0;
}

void threadEnds(void *block, OSL1_Descriptor *d) {
  if (d->term) d->term(block);
  std::free(block);
}

}  // namespace

// Host blocks come from the platform allocator, not the library's hooks: they belong to
// the host service and outlive any one initialisation of the library.
void *OSL1_ResolveProcess(OSL1_Descriptor *d, const char *, int) {
  void *b = __atomic_load_n(&d->resolved, __ATOMIC_ACQUIRE);
  if (b) return b;
  pthread_mutex_lock(&g_resolve);
  if (!d->resolved) {
    void *block = std::calloc(1, d->blockSize ? d->blockSize : 1);
    if (block) {
      if (d->init) d->init(block);
      if (g_processCount < kMaxProcess) g_process[g_processCount++] = d;
      __atomic_store_n(&d->resolved, block, __ATOMIC_RELEASE);
    }
  }
  b = d->resolved;
  pthread_mutex_unlock(&g_resolve);
  return b;
}

namespace {
struct ThreadSlot {
  OSL1_Descriptor *descriptor;
  void *block;
};
void threadDestructor(void *p) {
  ThreadSlot *s = static_cast<ThreadSlot *>(p);
  threadEnds(s->block, s->descriptor);
  std::free(s);
}
}  // namespace

void *OSL1_ResolveThread(OSL1_Descriptor *process, OSL1_Descriptor *d, const char *module, int line) {
  if (process && !OSL1_ResolveProcess(process, module, line)) return nullptr;
  if (!d->keyReady.load(std::memory_order_acquire)) {
    pthread_mutex_lock(&g_resolve);
    if (!d->keyReady.load(std::memory_order_relaxed)) {
      if (pthread_key_create(&d->key, threadDestructor) != 0) {
        pthread_mutex_unlock(&g_resolve);
        return nullptr;
      }
      d->keyReady.store(1, std::memory_order_release);
    }
    pthread_mutex_unlock(&g_resolve);
  }
  ThreadSlot *s = static_cast<ThreadSlot *>(pthread_getspecific(d->key));
  if (s) return s->block;
  s = static_cast<ThreadSlot *>(std::calloc(1, sizeof(ThreadSlot)));
  void *block = std::calloc(1, d->blockSize ? d->blockSize : 1);
  if (!s || !block) {
    std::free(s);
    std::free(block);
    return nullptr;
  }
  s->descriptor = d;
  s->block = block;
  if (d->init) d->init(block);
  pthread_setspecific(d->key, s);
  return block;
}
