// Threads with the stacks that object managers give theirs.
#pragma once

#include <pthread.h>

#include <cstddef>
#include <functional>
#include <stdexcept>

/// Runs `work` to its end on a thread of its own with that much stack. What `work` throws ends the program.
class SmallStackThread {
 public:
  static constexpr std::size_t stackSize = std::size_t{256} * 1024;

  explicit SmallStackThread(std::function<void()> work) : work_(std::move(work)) {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setstacksize(&attributes, stackSize);
    const int failure = pthread_create(
        &thread_, &attributes,
        [](void* self) -> void* {
          static_cast<SmallStackThread*>(self)->work_();
          return nullptr;
        },
        this);
    pthread_attr_destroy(&attributes);
    if (failure != 0) {
      throw std::runtime_error("no thread");
    }
  }
  ~SmallStackThread() { pthread_join(thread_, nullptr); }
  SmallStackThread(const SmallStackThread&) = delete;
  SmallStackThread& operator=(const SmallStackThread&) = delete;

 private:
  std::function<void()> work_;
  pthread_t thread_{};
};
