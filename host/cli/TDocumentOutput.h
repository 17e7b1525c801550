#pragma once

#include "host/core/TUniqueFd.h"

#include <string>

namespace vrxhost {

// Standard output, kept for the document alone: while an object lives, descriptor 1 leads to standard error, so that
// whatever a plug-in prints does not end up inside the document.
class TDocumentOutput
{
  public:
    // Throws: std::system_error when the descriptors cannot be arranged.
    TDocumentOutput();
    ~TDocumentOutput();

    // Writes all of it, unless stopFd becomes readable first.
    // Returns: an errno (EPIPE when the reader has gone, ECANCELED when stopped), 0 for success.
    int Write(const std::string& text, int stopFd);

  private:
    NKOLVRX20::TUniqueFd fFd;
};

} // namespace vrxhost
