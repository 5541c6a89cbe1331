#pragma once

#include <pthread.h>

namespace senseloom::trace {

class Mutex {
 public:
  void lock() { pthread_mutex_lock(&mutex); }
  void unlock() { pthread_mutex_unlock(&mutex); }

 private:
  pthread_mutex_t mutex = PTHREAD_MUTEX_INITIALIZER;
};

class Lock {
 public:
  explicit Lock(Mutex& toLock) : mutex(toLock) { mutex.lock(); }
  ~Lock() { mutex.unlock(); }
  Lock(const Lock&) = delete;
  Lock& operator=(const Lock&) = delete;

 private:
  Mutex& mutex;
};

}  // namespace senseloom::trace
