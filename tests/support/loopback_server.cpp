#include "support/loopback_server.h"

#ifdef _WIN32
#include <winsock2.h>
#include <ws2tcpip.h>
#else
#include <arpa/inet.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>
#endif

#include <cstdint>
#include <cstdlib>

#include "base/text.h"

namespace kestrune::test {
namespace {

#ifdef _WIN32
using Socket = SOCKET;
using Length = int;
void CloseSocket(Socket s) { closesocket(s); }
struct WinsockUser {
  WinsockUser() {
    WSADATA data;
    WSAStartup(MAKEWORD(2, 2), &data);
  }
};
#else
using Socket = int;
using Length = std::size_t;
void CloseSocket(Socket s) { close(s); }
struct WinsockUser {};
#endif

Socket AsSocket(std::intptr_t value) { return static_cast<Socket>(value); }

std::string ReadRequest(Socket client) {
  std::string request;
  char buffer[4096];
  std::size_t bodyStart = std::string::npos;
  std::size_t length = 0;
  for (;;) {
    const auto got = recv(client, buffer, static_cast<Length>(sizeof(buffer)), 0);
    if (got <= 0) break;
    request.append(buffer, static_cast<std::size_t>(got));
    if (bodyStart == std::string::npos) {
      const std::size_t end = request.find("\r\n\r\n");
      if (end == std::string::npos) continue;
      bodyStart = end + 4;
      const std::size_t header = AsciiUpper(AsciiToUtf16(request.substr(0, end))).find(u"CONTENT-LENGTH:");
      if (header != std::u16string::npos) length = std::strtoul(request.c_str() + header + 15, nullptr, 10);
    }
    if (request.size() >= bodyStart + length) break;
  }
  return request;
}

}  // namespace

LoopbackServer::LoopbackServer() {
  static WinsockUser winsock;
  (void)winsock;
  const Socket listener = socket(AF_INET, SOCK_STREAM, 0);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = 0;
  bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof(address));
  listen(listener, 8);
  socklen_t size = sizeof(address);
  getsockname(listener, reinterpret_cast<sockaddr*>(&address), &size);
  port_ = ntohs(address.sin_port);
  listener_ = static_cast<std::intptr_t>(listener);
  thread_ = std::thread([this] { Serve(); });
}

LoopbackServer::~LoopbackServer() {
  stopping_ = true;
  // Wake the blocked accept with a connection of our own.
  const Socket wake = socket(AF_INET, SOCK_STREAM, 0);
  sockaddr_in address{};
  address.sin_family = AF_INET;
  address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  address.sin_port = htons(port_);
  connect(wake, reinterpret_cast<sockaddr*>(&address), sizeof(address));
  thread_.join();
  CloseSocket(wake);
  CloseSocket(AsSocket(listener_));
}

std::u16string LoopbackServer::Url(const std::string& path) const {
  return AsciiToUtf16("http://127.0.0.1:" + std::to_string(port_) + path);
}

void LoopbackServer::Serve() {
  for (;;) {
    const Socket client = accept(AsSocket(listener_), nullptr, nullptr);
    if (stopping_) {
      CloseSocket(client);
      return;
    }
    const std::string request = ReadRequest(client);
    const std::size_t methodEnd = request.find(' ');
    const std::size_t pathEnd = request.find(' ', methodEnd + 1);
    const std::size_t bodyStart = request.find("\r\n\r\n");
    std::string answer = "BAD";
    int status = 400;
    if (methodEnd != std::string::npos && pathEnd != std::string::npos && bodyStart != std::string::npos) {
      const std::string path = request.substr(methodEnd + 1, pathEnd - methodEnd - 1);
      answer = request.substr(0, methodEnd) + " " + path + " " + request.substr(bodyStart + 4);
      status = path.rfind("/status/", 0) == 0 ? std::atoi(path.c_str() + 8) : 200;
    }
    const std::string response = "HTTP/1.1 " + std::to_string(status) + " X\r\nContent-Length: " +
                                 std::to_string(answer.size()) + "\r\nConnection: close\r\n\r\n" + answer;
    send(client, response.data(), static_cast<Length>(response.size()), 0);
    CloseSocket(client);
  }
}

}  // namespace kestrune::test
