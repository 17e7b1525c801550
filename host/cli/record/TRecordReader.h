// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"
#include "host/inmem/TInmemNamespace.h"

#include <boost/shared_ptr.hpp>

#include <istream>
#include <map>
#include <string>
#include <vector>

namespace vrxhost {

// Why a record is refused, as a sentence that begins with "FILE:LINE: " where a line is at fault.
class TRecordError : public TFailure
{
  public:
    using TFailure::TFailure;
};

// A machine as it was recorded. A record answers no calls of methods.
struct TRecord
{
    boost::shared_ptr<NKOLVRX20::TInmemNamespace> fNamespace;
    TDocumentHead fHead; // of the recording run; the command is empty
    std::vector<TLoss> fLosses;
    std::vector<std::string> fLog;
    std::map<std::string, long> fMilliseconds; // of the first enumeration, by class
    bool fIsComplete = false;
};

// Reads a record, or refuses it as a whole: a file of another kind or a later version, one that was cut or damaged, and
// one that exceeds a limit (docs/limits.md). Memory grows with the bytes that are read, not with numbers in them.
// name: of the file, for the sentence.
// Throws: TRecordError.
TRecord ReadRecord(std::istream& file, const std::string& name);

// Throws: TRecordError, also for a file that cannot be opened.
TRecord ReadRecordFile(const std::string& path);

} // namespace vrxhost
