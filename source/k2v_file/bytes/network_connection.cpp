#include "torvane/bytes/network_connection.h"

#include <cstdio>

#ifdef _WIN32
#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <winsock2.h>
#include <ws2tcpip.h>
#else
#include <cerrno>
#include <fcntl.h>
#include <netdb.h>
#include <netinet/in.h>
#include <netinet/tcp.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>
#endif

namespace _torvane_
{

namespace
{

// The systems differ in the names and number types of the calls; all that follows this block is the same for both.
#ifdef _WIN32

using SocketHandle = SOCKET;
using PollEntry = WSAPOLLFD;
constexpr SocketHandle kNoSocket = INVALID_SOCKET;
constexpr int kSendFlags = 0;

Bool StartNetwork()
{
  static const Bool kStarted = [] {
    WSADATA data;
    return WSAStartup(MAKEWORD(2, 2), &data) == 0;
  }();
  return kStarted;
}

void CloseHandleOf(SocketHandle handle) { closesocket(handle); }
int PollOne(PollEntry& entry, int milliseconds) { return WSAPoll(&entry, 1, milliseconds); }
Bool WasInterrupted() { return false; }
Bool MustWait() { return WSAGetLastError() == WSAEWOULDBLOCK; }
Bool IsConnecting() { return WSAGetLastError() == WSAEWOULDBLOCK; }
Bool WasAborted() { return WSAGetLastError() == WSAECONNRESET; }
SocketHandle NewSocket(const addrinfo& address)
{
  return ::WSASocketW(address.ai_family, address.ai_socktype, address.ai_protocol, nullptr, 0,
                      WSA_FLAG_OVERLAPPED | WSA_FLAG_NO_HANDLE_INHERIT);
}
Bool MakeNonBlocking(SocketHandle handle)
{
  u_long on = 1;
  return ioctlsocket(handle, FIONBIO, &on) == 0;
}
LLong SendSome(SocketHandle handle, const UChar* data, int size)
{
  return ::send(handle, reinterpret_cast<const char*>(data), size, kSendFlags);
}
LLong ReceiveSome(SocketHandle handle, UChar* data, int size)
{
  return ::recv(handle, reinterpret_cast<char*>(data), size, 0);
}
Bool SetOption(SocketHandle handle, int level, int option, int value)
{
  return ::setsockopt(handle, level, option, reinterpret_cast<const char*>(&value), sizeof value) == 0;
}
int GetSocketError(SocketHandle handle)
{
  int error = 0;
  int size = sizeof error;
  return ::getsockopt(handle, SOL_SOCKET, SO_ERROR, reinterpret_cast<char*>(&error), &size) == 0 ? error : -1;
}

// Two programs must not share a port, which SO_REUSEADDR would allow here.
constexpr int kListenOption = SO_EXCLUSIVEADDRUSE;

#else

using SocketHandle = int;
using PollEntry = pollfd;
constexpr SocketHandle kNoSocket = -1;
// A connection that is gone is a result, not a signal.
#ifdef MSG_NOSIGNAL
constexpr int kSendFlags = MSG_NOSIGNAL;
#else
constexpr int kSendFlags = 0;
#endif

Bool StartNetwork() { return true; }
void CloseHandleOf(SocketHandle handle) { ::close(handle); }
int PollOne(PollEntry& entry, int milliseconds) { return ::poll(&entry, 1, milliseconds); }
Bool WasInterrupted() { return errno == EINTR; }
Bool MustWait()
{
#if EAGAIN != EWOULDBLOCK
  if (errno == EWOULDBLOCK)
    return true;
#endif
  return errno == EAGAIN;
}
Bool IsConnecting() { return errno == EINPROGRESS; }
Bool WasAborted() { return errno == ECONNABORTED; }
SocketHandle NewSocket(const addrinfo& address)
{
  return ::socket(address.ai_family, address.ai_socktype, address.ai_protocol);
}
Bool MakeNonBlocking(SocketHandle handle)
{
#ifdef SO_NOSIGPIPE
  const int on = 1;
  ::setsockopt(handle, SOL_SOCKET, SO_NOSIGPIPE, &on, sizeof on);
#endif
  ::fcntl(handle, F_SETFD, FD_CLOEXEC);
  const int flags = ::fcntl(handle, F_GETFL, 0);
  return flags >= 0 && ::fcntl(handle, F_SETFL, flags | O_NONBLOCK) == 0;
}
LLong SendSome(SocketHandle handle, const UChar* data, int size)
{
  return ::send(handle, data, static_cast<std::size_t>(size), kSendFlags);
}
LLong ReceiveSome(SocketHandle handle, UChar* data, int size)
{
  return ::recv(handle, data, static_cast<std::size_t>(size), 0);
}
Bool SetOption(SocketHandle handle, int level, int option, int value)
{
  return ::setsockopt(handle, level, option, &value, sizeof value) == 0;
}
int GetSocketError(SocketHandle handle)
{
  int error = 0;
  socklen_t size = sizeof error;
  return ::getsockopt(handle, SOL_SOCKET, SO_ERROR, &error, &size) == 0 ? error : -1;
}

// A listener that was closed a moment ago leaves its port usable.
constexpr int kListenOption = SO_REUSEADDR;

#endif

constexpr int kBacklog = 16;
constexpr LLong kLargestStep = 1 << 20; // bytes handed to the system in one call

SocketHandle HandleOf(const detail::Socket& socket) { return static_cast<SocketHandle>(socket.GetHandle()); }

// Waits until the socket can be read or written. False when the time is over. A broken connection counts as ready:
// the next call then tells.
Bool Wait(const detail::Socket& socket, short events)
{
  PollEntry entry = {};
  entry.fd = HandleOf(socket);
  entry.events = events;
  const Long timeout = socket.GetTimeout();
  for (;;) {
    const int ready = PollOne(entry, timeout < 0 ? -1 : timeout);
    if (ready >= 0 || !WasInterrupted())
      return ready > 0;
  }
}

// Moves `size` bytes by `step`, which moves some of them, and waits for `events` in between.
template <class Step>
LLong MoveAll(const detail::Socket& socket, LLong size, short events, Step step)
{
  LLong done = 0;
  while (socket.IsOpen() && done < size) {
    const LLong left = size - done;
    const LLong moved = step(done, static_cast<int>(left < kLargestStep ? left : kLargestStep));
    if (moved > 0)
      done += moved;
    else if (moved == 0 || !(WasInterrupted() || (MustWait() && Wait(socket, events))))
      break;
  }
  return done;
}

// The addresses of a host name, and their release.
struct AddressList
{
  addrinfo* first = nullptr;

  AddressList(const char* host, UWord port, int flags)
  {
    char service[8];
    std::snprintf(service, sizeof service, "%u", static_cast<unsigned>(port));
    addrinfo hints = {};
    hints.ai_family = AF_UNSPEC;
    hints.ai_socktype = SOCK_STREAM;
    hints.ai_protocol = IPPROTO_TCP;
    hints.ai_flags = flags | AI_NUMERICSERV;
    if (!host || !StartNetwork() || ::getaddrinfo(host, service, &hints, &first) != 0)
      first = nullptr;
  }
  ~AddressList()
  {
    if (first)
      ::freeaddrinfo(first);
  }
  AddressList(const AddressList&) = delete;
  AddressList& operator=(const AddressList&) = delete;
};

// Makes `socket` a new one for `address` that never blocks.
Bool OpenFor(detail::Socket& socket, const addrinfo& address)
{
  const SocketHandle handle = NewSocket(address);
  if (handle == kNoSocket)
    return false;
  socket.Take(static_cast<std::intptr_t>(handle));
  return MakeNonBlocking(handle);
}

// The values in a connection are small and must not wait for one another.
void SendAtOnce(const detail::Socket& socket) { SetOption(HandleOf(socket), IPPROTO_TCP, TCP_NODELAY, 1); }

UWord PortOf(const detail::Socket& socket)
{
  sockaddr_storage address = {};
  socklen_t size = sizeof address;
  if (::getsockname(HandleOf(socket), reinterpret_cast<sockaddr*>(&address), &size) != 0)
    return 0;
  return ntohs(address.ss_family == AF_INET6 ? reinterpret_cast<sockaddr_in6&>(address).sin6_port
                                             : reinterpret_cast<sockaddr_in&>(address).sin_port);
}

Bool ConnectTo(detail::Socket& socket, const addrinfo& address)
{
  if (!OpenFor(socket, address))
    return false;
  const auto size = static_cast<socklen_t>(address.ai_addrlen);
  if (::connect(HandleOf(socket), address.ai_addr, size) == 0)
    return true;
  return (IsConnecting() || WasInterrupted()) && Wait(socket, POLLOUT) && GetSocketError(HandleOf(socket)) == 0;
}

} // namespace

void detail::Socket::Take(std::intptr_t handle) noexcept
{
  Close();
  handle_ = handle;
}

void detail::Socket::Close() noexcept
{
  if (IsOpen())
    CloseHandleOf(HandleOf(*this));
  handle_ = kNone;
}

Bool NetworkConnection::Connect(const char* host, UWord port) noexcept
{
  Close();
  const AddressList addresses(host, port, 0);
  for (const addrinfo* address = addresses.first; address; address = address->ai_next) {
    if (ConnectTo(socket_, *address)) {
      SendAtOnce(socket_);
      return true;
    }
  }
  Close();
  return false;
}

LLong NetworkConnection::Send(const void* data, LLong size) noexcept
{
  const auto* from = static_cast<const UChar*>(data);
  return MoveAll(socket_, size, POLLOUT,
                 [&](LLong done, int count) { return SendSome(HandleOf(socket_), from + done, count); });
}

LLong NetworkConnection::Receive(void* data, LLong size) noexcept
{
  auto* to = static_cast<UChar*>(data);
  return MoveAll(socket_, size, POLLIN,
                 [&](LLong done, int count) { return ReceiveSome(HandleOf(socket_), to + done, count); });
}

Bool NetworkListener::Listen(UWord port, const char* address) noexcept
{
  Close();
  const AddressList addresses(address, port, AI_NUMERICHOST | AI_PASSIVE);
  if (!addresses.first || !OpenFor(socket_, *addresses.first)) {
    Close();
    return false;
  }
  const SocketHandle handle = HandleOf(socket_);
  const auto size = static_cast<socklen_t>(addresses.first->ai_addrlen);
  if (!SetOption(handle, SOL_SOCKET, kListenOption, 1) || ::bind(handle, addresses.first->ai_addr, size) != 0 ||
      ::listen(handle, kBacklog) != 0) {
    Close();
    return false;
  }
  port_ = PortOf(socket_);
  return true;
}

Bool NetworkListener::Accept(NetworkConnection& connection) noexcept
{
  connection.Close();
  while (socket_.IsOpen() && Wait(socket_, POLLIN)) {
    const SocketHandle handle = ::accept(HandleOf(socket_), nullptr, nullptr);
    if (handle != kNoSocket) {
      connection.socket_.Take(static_cast<std::intptr_t>(handle));
      SendAtOnce(connection.socket_);
      if (MakeNonBlocking(handle))
        return true;
      connection.Close();
      return false;
    }
    // Whoever was announced may be gone again.
    if (!MustWait() && !WasInterrupted() && !WasAborted())
      return false;
  }
  return false;
}

void NetworkListener::Close() noexcept
{
  socket_.Close();
  port_ = 0;
}

} // namespace _torvane_
