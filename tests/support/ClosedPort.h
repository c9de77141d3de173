#pragma once
// Loopback ports for tests of what reaches a server: a socket bound to a port the
// kernel picked, and a port nobody listens on (bound, then closed again).

#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace dvtest {

// A socket bound to a free loopback port; the port in *port.
inline int LoopbackSocket(int* port) {
  int s = ::socket(AF_INET, SOCK_STREAM, 0);
  sockaddr_in addr{};
  addr.sin_family = AF_INET;
  addr.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
  ::bind(s, reinterpret_cast<sockaddr*>(&addr), sizeof addr);
  socklen_t len = sizeof addr;
  ::getsockname(s, reinterpret_cast<sockaddr*>(&addr), &len);
  *port = ntohs(addr.sin_port);
  return s;
}

inline int ClosedPort() {
  int port = 0;
  ::close(LoopbackSocket(&port));
  return port;
}

}  // namespace dvtest
