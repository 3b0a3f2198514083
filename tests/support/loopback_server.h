#pragma once

#include <atomic>
#include <cstdint>
#include <string>
#include <thread>

namespace kestrune::test {

// A tiny HTTP server on 127.0.0.1 for the HTTP clients' tests. Each request is answered with
// "METHOD PATH BODY" as text; a path starting with "/status/NNN" answers with that status.
class LoopbackServer {
 public:
  LoopbackServer();
  ~LoopbackServer();
  LoopbackServer(const LoopbackServer&) = delete;
  LoopbackServer& operator=(const LoopbackServer&) = delete;

  unsigned short port() const { return port_; }
  std::u16string Url(const std::string& path) const;

 private:
  void Serve();

  std::intptr_t listener_ = -1;
  unsigned short port_ = 0;
  std::atomic<bool> stopping_{false};
  std::thread thread_;
};

}  // namespace kestrune::test
