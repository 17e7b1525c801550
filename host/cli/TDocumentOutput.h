// SPDX-License-Identifier: MIT
#pragma once

#include "host/core/TUniqueFd.h"

#include <string>

namespace vrxhost {

// Standard output, kept for the document alone: while an object lives, descriptor 1 leads to standard error, so that
// whatever a plug-in prints stays out of the document.
class TDocumentOutput
{
  public:
    // Throws: std::system_error when arranging the descriptors fails.
    TDocumentOutput();
    ~TDocumentOutput();

    bool IsTerminal() const;

    // Writes all of it. Once stopFd is readable, the reader has half a second left to take the rest.
    // Returns: an errno (EPIPE when the reader has gone, ECANCELED when it was too slow after a stop), 0 for success.
    int Write(const std::string& text, int stopFd);

  private:
    NKOLVRX20::TUniqueFd fFd;
};

} // namespace vrxhost
