// The extension table: threads, mutexes and conditions, thinly over those of POSIX.
#include <cimom/broker/BrokerState.h>

#include <pthread.h>
#include <cerrno>
#include <string>
#include <type_traits>

namespace cimom {

namespace {

// Handles of threads are POSIX's own numbers in a pointer.
static_assert(sizeof(pthread_t) == sizeof(void*) && std::is_same_v<pthread_once_t, int>);
pthread_t threadOf(void* handle) {
  return reinterpret_cast<pthread_t>(handle);
}

// The text lives in the calling thread's request, outside of one until the thread asks again.
char* resolveFileName(const char* name) {
  if (name == nullptr) {
    return nullptr;
  }
  static thread_local std::string resolved;
  resolved = "lib" + std::string(name) + ".so";
  Request* const request = Request::current();
  return request == nullptr ? resolved.data() : const_cast<char*>(request->arena().copy(resolved).data());
}

void* newThread(void* (*start)(void*), void* argument, int detached) {
  pthread_t thread{};
  if (start == nullptr || pthread_create(&thread, nullptr, start, argument) != 0) {
    return nullptr;
  }
  if (detached != 0) {
    pthread_detach(thread);
  }
  // CMPI has threads as pointers, POSIX as numbers.
  return reinterpret_cast<void*>(thread);  // NOLINT(performance-no-int-to-ptr)
}

int joinThread(void* thread, void** result) {
  return pthread_join(threadOf(thread), result);
}

int exitThread(void* result) {
  pthread_exit(result);
}

int cancelThread(void* thread) {
  return pthread_cancel(threadOf(thread));
}

int threadSleep(CMPIUint32 milliseconds) {
  timespec left{static_cast<time_t>(milliseconds / 1000), static_cast<long>(milliseconds % 1000) * 1000000};
  while (nanosleep(&left, &left) != 0) {
    if (errno != EINTR) {
      return errno;
    }
  }
  return 0;
}

int threadOnce(int* once, void (*function)()) {
  return once == nullptr || function == nullptr ? EINVAL : pthread_once(once, function);
}

int createThreadKey(unsigned long* key, void (*cleanup)(void*)) {
  pthread_key_t made{};
  const int error = key == nullptr ? EINVAL : pthread_key_create(&made, cleanup);
  if (error == 0) {
    *key = made;
  }
  return error;
}

int destroyThreadKey(unsigned long key) {
  return pthread_key_delete(static_cast<pthread_key_t>(key));
}

void* getThreadSpecific(unsigned long key) {
  return pthread_getspecific(static_cast<pthread_key_t>(key));
}

int setThreadSpecific(unsigned long key, void* value) {
  return pthread_setspecific(static_cast<pthread_key_t>(key), value);
}

// Recursive: providers are written for brokers of either kind, and this one forgives a second lock.
void* newMutex(int /*options*/) {
  pthread_mutexattr_t attributes;
  pthread_mutexattr_init(&attributes);
  pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_RECURSIVE);
  auto* const mutex = new pthread_mutex_t;
  pthread_mutex_init(mutex, &attributes);
  pthread_mutexattr_destroy(&attributes);
  return mutex;
}

void destroyMutex(void* mutex) {
  if (mutex != nullptr) {
    pthread_mutex_destroy(static_cast<pthread_mutex_t*>(mutex));
    delete static_cast<pthread_mutex_t*>(mutex);
  }
}

void lockMutex(void* mutex) {
  if (mutex != nullptr) {
    pthread_mutex_lock(static_cast<pthread_mutex_t*>(mutex));
  }
}

void unlockMutex(void* mutex) {
  if (mutex != nullptr) {
    pthread_mutex_unlock(static_cast<pthread_mutex_t*>(mutex));
  }
}

void* newCondition(int /*options*/) {
  auto* const condition = new pthread_cond_t;
  pthread_cond_init(condition, nullptr);
  return condition;
}

void destroyCondition(void* condition) {
  if (condition != nullptr) {
    pthread_cond_destroy(static_cast<pthread_cond_t*>(condition));
    delete static_cast<pthread_cond_t*>(condition);
  }
}

int condWait(void* condition, void* mutex) {
  return condition == nullptr || mutex == nullptr ? EINVAL
                                                  : pthread_cond_wait(static_cast<pthread_cond_t*>(condition),
                                                                      static_cast<pthread_mutex_t*>(mutex));
}

// Until a point in time of the real-time clock.
int timedCondWait(void* condition, void* mutex, timespec* until) {
  return condition == nullptr || mutex == nullptr || until == nullptr
             ? EINVAL
             : pthread_cond_timedwait(static_cast<pthread_cond_t*>(condition),
                                      static_cast<pthread_mutex_t*>(mutex), until);
}

int signalCondition(void* condition) {
  return condition == nullptr ? EINVAL : pthread_cond_signal(static_cast<pthread_cond_t*>(condition));
}

}  // namespace

CMPIBrokerExtFT operatingSystemTable = {
    tableVersion, resolveFileName, newThread,       joinThread,       exitThread,        cancelThread,
    threadSleep,  threadOnce,      createThreadKey, destroyThreadKey, getThreadSpecific, setThreadSpecific,
    newMutex,     destroyMutex,    lockMutex,       unlockMutex,      newCondition,      destroyCondition,
    condWait,     timedCondWait,   signalCondition,
};

}  // namespace cimom
