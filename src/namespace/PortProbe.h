// SPDX-License-Identifier: MIT
#pragma once

#include <string>

namespace NKOLVRX20 {

// Tries ports of one address, all with one socket, which the destructor closes. From then on a port that was found free
// is open to every process, and another may take it before the server does.
class TPortProbe
{
  public:
    // The host is a numeric address. Throws: TVRXException 42, after a log line, when making the socket fails.
    explicit TPortProbe(const std::string& host);
    ~TPortProbe();

    TPortProbe(const TPortProbe&) = delete;
    TPortProbe& operator=(const TPortProbe&) = delete;

    // Requires: that every earlier call has returned false; a socket is bound once.
    bool CanBind(unsigned short port) const;

  private:
    const std::string fHost;
    const int fDescriptor;
};

} // namespace NKOLVRX20
