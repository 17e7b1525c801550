// SPDX-License-Identifier: MIT
#pragma once

#include "pegasus/mof/DefinitionHandler.h"
#include "pegasus/mof/SkippedDefinitions.h"

#include <condition_variable>
#include <deque>
#include <exception>
#include <mutex>
#include <string>
#include <thread>
#include <unordered_map>
#include <unordered_set>
#include <vector>

namespace Pegasus::mof {

// A qualifier as a text names it.
struct KnownQualifier
{
    CIMName name; // in the letter case of the text
    CIMQualifierDecl declaration;
};

// Delivers a compilation's definitions to the handler and asks it for earlier ones.
//
// A class is created on a second thread while the compiler parses on, since a server needs more time for a class than
// the compiler for the next one. Everything else waits until all classes before it are created: the handler gets the
// same calls in the same order as without that thread. What the compiler asks for most, a declaration or the existence
// of a class that it has met before, is answered from memory.
//
// Throws: finish() and every function that calls the handler throw the MofError of the first class that failed, which
//     has its skipped definitions added. Nothing is delivered after that class.
// Thread: one thread, that of the compiler.
// Blocks: as long as the handler.
class Delivery
{
  public:
    // Requires: the arguments outlive the object.
    Delivery(DefinitionHandler& handler, const CompileLimits& limits) : fHandler(handler), fLimits(limits) {}
    // Drops the classes that wait.
    ~Delivery();
    Delivery(const Delivery&) = delete;
    Delivery& operator=(const Delivery&) = delete;

    // Returns: the declaration of the qualifier that is written so; null when it is absent.
    // Ownership: the object's, until the next declaration is delivered.
    const KnownQualifier* findQualifier(const std::string& written);
    // As in DefinitionHandler.
    bool findClass(const CIMName& name, CIMClass& found);
    // Returns: true also for a class that still waits: if it fails, the compilation ends with its error.
    bool hasClass(const CIMName& name);
    void declareQualifier(const CIMQualifierDecl& declaration);
    bool createInstance(const CIMInstance& newInstance);
    void warn(const SourcePlace& place, const std::string& text);

    // Has the class created soon. One that exists already causes a warning; one that fails, an error. Both are
    // reported at `place`.
    // `files`: where the compilation stands.
    void createClass(const CIMClass& newClass, const SourcePlace& place, const OpenFiles& files);
    // Waits until every class is created.
    void finish();

  private:
    struct WaitingClass
    {
        CIMClass itsClass;
        SourcePlace place;
        OpenFiles files;
    };

    void startCreator();
    void createWaiting();
    std::exception_ptr create(const WaitingClass& waiting);
    void remember(const CIMName& className);

    DefinitionHandler& fHandler;
    const CompileLimits& fLimits;
    std::unordered_map<std::string, KnownQualifier> fQualifiers; // by name as written
    std::unordered_set<std::string> fClassNames;                 // of classes that exist or wait, as written

    std::mutex fMutex; // for the members below
    std::condition_variable fChanged;
    std::deque<WaitingClass> fWaiting;  // the first one is being created
    std::vector<WaitingClass> fCreated; // the compiler, which the server does not wait for, frees their memory
    std::exception_ptr fFailure;
    bool fIsEnding = false;
    std::thread fCreator; // runs createWaiting() from the first class on
};

} // namespace Pegasus::mof
