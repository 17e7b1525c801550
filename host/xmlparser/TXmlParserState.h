// SPDX-License-Identifier: MIT
#pragma once

#include <host/TXmlParser.h>

#include <expat.h>

#include <exception>
#include <memory>
#include <string>

namespace NKOLVRX20 {

// The state of one parse, and the bridge from expat's C callbacks. Exceptions must stay out of expat's C frames: one
// that a callback throws is kept, ends the parse, and is thrown again by Parse.
//
// After an unread DTD or parameter entity, expat assumes that unknown entities are declared there, and silently drops
// references to them in attribute values. So the raw text of tags and attribute declarations is searched for
// references.
struct TXmlParser::TState
{
    struct TExpatDeleter
    {
        void operator()(XML_Parser parser) const { XML_ParserFree(parser); }
    };

    explicit TState(TXmlParser& owner) : fOwner(owner) {}

    TXmlParser& fOwner;
    std::unique_ptr<XML_ParserStruct, TExpatDeleter> fExpat;
    unsigned int fDepth = 0;
    std::string fRefusal; // why this class, rather than expat, ended the parse
    std::exception_ptr fCallbackException;
    bool fHasUnreadDeclarations = false;
    std::string fRawMarkup; // collected only after unread declarations

    // Throws: std::bad_alloc.
    void Install();
    void Stop() { XML_StopParser(fExpat.get(), XML_FALSE); }
    bool HasEnded() const { return !fRefusal.empty() || fCallbackException; }
    void Refuse(const std::string& reason)
    {
        fRefusal = reason;
        Stop();
    }
    void RefuseEntity(const std::string& entity);
    void RefuseEntitiesOfTag();
    void RefuseEntitiesOfRawMarkup();

    static TState& From(void* state) { return *static_cast<TState*>(state); }

    // Calls "call(state)" while the parse goes on: expat delivers what it has already tokenised even after a stop.
    template <typename Call> static void Deliver(void* state, Call call)
    {
        TState& self = From(state);
        if (self.HasEnded()) {
            return;
        }
        try {
            call(self);
        } catch (...) {
            self.fCallbackException = std::current_exception();
            self.Stop();
        }
    }

    static void OnStart(void* state, const XML_Char* name, const XML_Char** attributes);
    static void OnEnd(void* state, const XML_Char* name);
    static void OnInstruction(void* state, const XML_Char* target, const XML_Char* data);
    static void OnText(void* state, const XML_Char* text, int length);
    static void OnNotation(void* state, const XML_Char* name, const XML_Char* base, const XML_Char* systemId,
                           const XML_Char* publicId);
    static void OnEntityDeclaration(void* state, const XML_Char*, int, const XML_Char*, int, const XML_Char*,
                                    const XML_Char*, const XML_Char*, const XML_Char*);
    static int OnUnreadDeclarations(void* state);
    static void OnSkippedEntity(void* state, const XML_Char* name, int isParameterEntity);
    static void OnRawMarkup(void* state, const XML_Char* text, int length);
};

} // namespace NKOLVRX20
