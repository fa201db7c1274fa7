// Connected TCP sockets: what a network target of BaseFile sends and receives through.
#pragma once

#include <cstdint>

#include "torvane/types.h"

namespace _torvane_
{

inline constexpr Long kNetworkTimeout = 30000; // milliseconds, until SetTimeout tells another
inline constexpr Long kNetworkForever = -1;    // waits without end

namespace detail
{

// The operating system's socket and the patience with it; owns the socket.
class Socket
{
 public:
  Socket() noexcept = default;
  ~Socket() { Close(); }
  Socket(const Socket&) = delete;
  Socket& operator=(const Socket&) = delete;

  Bool IsOpen() const noexcept { return handle_ != kNone; }
  std::intptr_t GetHandle() const noexcept { return handle_; }
  void Take(std::intptr_t handle) noexcept;
  void Close() noexcept;
  Long GetTimeout() const noexcept { return timeout_; }
  void SetTimeout(Long milliseconds) noexcept { timeout_ = milliseconds; }

 private:
  static constexpr std::intptr_t kNone = -1;

  std::intptr_t handle_ = kNone;
  Long timeout_ = kNetworkTimeout;
};

} // namespace detail

// One end of a connection. It owns its socket and closes it at its end. May be handed from one thread to another, but
// is used by one at a time.
class NetworkConnection
{
 public:
  // Connects to `port` of `host`, a name or a numeric address of either family; every address of the name is tried.
  // A former connection is closed first. False if nobody answers in time.
  Bool Connect(const char* host, UWord port) noexcept;
  Bool IsConnected() const noexcept { return socket_.IsOpen(); }
  void Close() noexcept { socket_.Close(); }

  // How many milliseconds Connect (for each address), Send and Receive wait while nothing moves, or kNetworkForever.
  void SetTimeout(Long milliseconds) noexcept { socket_.SetTimeout(milliseconds); }

  // Sends `size` bytes and gives how many went out: fewer when the connection is gone or the time is over.
  LLong Send(const void* data, LLong size) noexcept;

  // Waits for `size` bytes and gives how many came: fewer when the other side has closed, the connection is gone or
  // the time is over.
  LLong Receive(void* data, LLong size) noexcept;

 private:
  friend class NetworkListener;

  detail::Socket socket_;
};

// Waits for others to connect.
class NetworkListener
{
 public:
  // Listens on `port` of `address`, a numeric address of either family; port 0 takes one that is free. As it stands
  // only programs on the same machine can connect. False if the port is taken.
  Bool Listen(UWord port = 0, const char* address = "127.0.0.1") noexcept;

  // The port in use; 0 while not listening.
  UWord GetPort() const noexcept { return port_; }

  // Waits for the next connection and puts it into `connection`, which is closed first and keeps its own timeout.
  // False when nobody came in time.
  Bool Accept(NetworkConnection& connection) noexcept;

  // How many milliseconds Accept waits, or kNetworkForever.
  void SetTimeout(Long milliseconds) noexcept { socket_.SetTimeout(milliseconds); }

  void Close() noexcept;

 private:
  detail::Socket socket_;
  UWord port_ = 0;
};

} // namespace _torvane_
