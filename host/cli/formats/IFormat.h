// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/Document.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace vrxhost {

struct TFormatOptions
{
    std::size_t fWidth = 80; // of a line of text
    bool fColor = false;
    bool fAll = false;    // also keys that repeat the class's and the system's name
    bool fRaw = false;    // numbers as delivered
    bool fStable = false; // without what differs between two runs on an unchanged machine
};

// A form of the document. One class a format.
class IFormat
{
  public:
    virtual ~IFormat() = default;

    // Returns: what takes instances while they are collected; null for a format that needs the whole document.
    // head: goes with each instance.
    virtual IInstanceSink* BeginStream(const TDocumentHead& head);

    // Returns: the document; after a stream what remains of it.
    virtual std::string Finish(const TDocument& document) = 0;
};

// Takes a piece of the document, in order.
using TDocumentWriter = std::function<void(const std::string&)>;

std::unique_ptr<IFormat> MakeTableFormat(const TFormatOptions& options, TDocumentWriter write);
std::unique_ptr<IFormat> MakeTreeFormat(const TFormatOptions& options);
std::unique_ptr<IFormat> MakeJsonFormat(const TFormatOptions& options, TDocumentWriter write);
std::unique_ptr<IFormat> MakeNdjsonFormat(const TFormatOptions& options, TDocumentWriter write);
std::unique_ptr<IFormat> MakeCsvFormat(const TFormatOptions& options, TDocumentWriter write);
std::unique_ptr<IFormat> MakeHtmlFormat(const TFormatOptions& options, TDocumentWriter write);

// Returns: the names of the formats, for the command line.
std::vector<std::string> FormatNames();

// Requires: one of the names.
std::unique_ptr<IFormat> MakeFormat(const std::string& name, const TFormatOptions& options, TDocumentWriter write);

} // namespace vrxhost
