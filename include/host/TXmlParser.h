#pragma once

#include <cstddef>
#include <map>
#include <string>

namespace NKOLVRX20 {

// A callback parser for small XML files.
// Thread: one at a time; one parse per object.
class TXmlParser
{
  public:
    TXmlParser();
    virtual ~TXmlParser();

    TXmlParser(const TXmlParser&) = delete;
    TXmlParser& operator=(const TXmlParser&) = delete;

    // The attributes are in byte order of their names. Names and values are UTF-8 and live for the call only.
    virtual void StartElement(const char* name, std::map<std::string, std::string>& attributes) = 0;
    virtual void EndElement(const char* name) = 0;
    virtual void processingInstruction(const char* target, const char* data) = 0;
    virtual void characters(const char* text, unsigned int length) = 0; // not zero-terminated
    virtual void notationDecl(const char* name, const char* publicId, const char* systemId) = 0;
    // Told of text that is not well formed; the parse ends there.
    virtual void FatalError(const char* message) = 0;

    // Parses bytes that need not be zero-terminated; never reads past length. What was seen before an error has been
    // delivered. Limits: 16 MiB, 64 levels; beyond them FatalError is called. Entity declarations are refused.
    // Returns: true when the text was well formed.
    bool Parse(const char* buffer, std::size_t length);

    // Returns: the line of the input, from 1, that the current callback is about.
    unsigned int GetCurLine() const;

  protected:
    // The parser's own steps, in the host's slot order.
    virtual void ParseJSSP();
    virtual void ParseCharData();
    virtual void GetAttributeNValue();

  private:
    struct TState;
    TState* fState;
};

} // namespace NKOLVRX20
