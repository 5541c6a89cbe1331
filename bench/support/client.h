#pragma once

#include <cstddef>
#include <utility>
#include <vector>

#include "require.h"
#include "senseloom.h"

namespace bench {

// An open session.
class Client {
 public:
  explicit Client(const char* sensor) : handle(ctx_open_session(sensor)) {
    require(handle != nullptr, "a session could not be opened");
  }
  ~Client() {
    if (handle == nullptr) return;
    ctx_option_t* list = nullptr;
    ctx_close_session(handle, &list);
    ctx_option_release(list);
  }
  Client(Client&& other) noexcept : handle(std::exchange(other.handle, nullptr)) {}
  Client& operator=(Client&&) = delete;

  void setOption(const char* option) const {
    ctx_option_t* list = nullptr;
    require(ctx_set_option(handle, 0, option, &list) == 0, "an option was refused");
    ctx_option_release(list);
  }

  void* handle;
};

// `count` sessions of a sensor, in opening order.
class Clients {
 public:
  Clients(size_t count, const char* sensor) {
    clients.reserve(count);
    for (size_t i = 0; i < count; ++i) clients.emplace_back(sensor);
  }
  // Without its sensor a session negotiates with nobody when it is closed. Else closing thousands would take minutes.
  ~Clients() { ctx_uninit(); }
  Clients(const Clients&) = delete;
  Clients& operator=(const Clients&) = delete;

  const Client& operator[](size_t index) const { return clients[index]; }
  size_t size() const { return clients.size(); }
  auto begin() const { return clients.begin(); }
  auto end() const { return clients.end(); }

 private:
  std::vector<Client> clients;
};

}  // namespace bench
