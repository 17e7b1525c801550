#pragma once

#include <string>

namespace NKOLVRX20 {

// Tries ports of one address, all with one socket, which is closed at the end. Nothing holds a port that was found
// free: another process may take it before the server does.
class TPortProbe
{
  public:
    // The host is an address in numbers. Throws: TVRXException 42, after a log line, when no socket can be made.
    explicit TPortProbe(const std::string& host);
    ~TPortProbe();

    TPortProbe(const TPortProbe&) = delete;
    TPortProbe& operator=(const TPortProbe&) = delete;

    // Requires: that no earlier call has returned true; a socket is bound once.
    bool CanBind(unsigned short port) const;

  private:
    const std::string fHost;
    const int fDescriptor;
};

} // namespace NKOLVRX20
