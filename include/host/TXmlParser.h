// SPDX-License-Identifier: MIT
#pragma once

#include <cstddef>
#include <map>
#include <string>

namespace NKOLVRX20 {

// A callback parser for small XML files. A plug-in derives from it and overrides the callbacks; the host provides Parse
// and GetCurLine. Any conforming parser will do that
//   - stops at the length it is given: the buffer is not zero-terminated;
//   - delivers the attributes of a start tag as one map, in byte order of their names;
//   - reports ill-formed text through FatalError alone.
// Here: TPEGASUSRequestedClassParser reads the *.classes.xml files with it.
// Thread: one at a time; one parse per object.
class TXmlParser
{
  public:
    TXmlParser();
    virtual ~TXmlParser();

    TXmlParser(const TXmlParser&) = delete;
    TXmlParser& operator=(const TXmlParser&) = delete;

    // A start tag, or the start of an empty element. Names and values are UTF-8 and live for the call only.
    virtual void StartElement(const char* name, std::map<std::string, std::string>& attributes) = 0;
    // An end tag, or the end of an empty element.
    virtual void EndElement(const char* name) = 0;
    // A processing instruction; the XML declaration is skipped.
    virtual void processingInstruction(const char* target, const char* data) = 0;
    // Text between tags, length bytes of it, possibly in several pieces.
    virtual void characters(const char* text, unsigned int length) = 0;
    // A notation of the document type; absent identifiers are empty.
    virtual void notationDecl(const char* name, const char* publicId, const char* systemId) = 0;
    // The text is ill-formed, or exceeds a limit; the parse ends after this call. A derived class may call it
    // itself to report what it rejects, and the parse goes on.
    virtual void FatalError(const char* message) = 0;

    // Parses a whole document. What precedes an error has been delivered.
    // In the reference host: at most 16 MiB and 64 levels; entity declarations are refused. References to entities of
    // unread DTDs and parameter entities are refused too.
    // Returns: true when the text was well formed.
    // Throws: what a callback throws, after the parser has stopped; std::bad_alloc.
    bool Parse(const char* buffer, std::size_t length);

    // Returns: the line of the input, from 1, that the current callback is about.
    unsigned int GetCurLine() const;

  protected:
    // The parser's own steps, in the host's slot order. Derived classes leave them alone.
    // In the reference host: they return at once.
    virtual void ParseJSSP();
    virtual void ParseCharData();
    virtual void GetAttributeNValue();

  private:
    struct TState;
    TState* fState;
};

} // namespace NKOLVRX20
