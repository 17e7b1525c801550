// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/record/RecordForm.h"
#include "host/cli/record/TRecordReader.h"
#include "host/inmem/TInmemClass.h"
#include "host/inmem/TInmemProvider.h"

#include <host/TInmemInstance.h>

#include <functional>
#include <map>

namespace vrxhost {

// Builds a record of its lines, one after the other; sums are the reader's.
// Thread: one at a time.
class TRecordParser
{
  public:
    TRecordParser();

    // Throws: std::runtime_error, what is wrong with the line as a sentence.
    void Add(std::string_view line);

    // Returns: whether the last line was the end.
    bool IsEnded() const { return fIsEnded; }

    TRecord Take() { return std::move(fRecord); }

  private:
    using THandler = void (TRecordParser::*)(TRecordFields&);

    static const std::map<std::string, THandler>& Handlers();

    template <typename Element> void SetQualified(const boost::shared_ptr<Element>& element);

    void AddTitle(TRecordFields& fields);
    void AddHost(TRecordFields& fields);
    void AddRun(TRecordFields& fields);
    void AddClass(TRecordFields& fields);
    void AddProperty(TRecordFields& fields);
    void AddMethod(TRecordFields& fields);
    void AddParameter(TRecordFields& fields);
    void AddQualifier(TRecordFields& fields);
    void AddProvider(TRecordFields& fields);
    void AddServes(TRecordFields& fields);
    void AddInstance(TRecordFields& fields);
    void AddValue(TRecordFields& fields);
    void AddServed(TRecordFields& fields);
    void AddLoss(TRecordFields& fields);
    void AddAbout(TRecordFields& fields);
    void AddLog(TRecordFields& fields);
    void AddEnd(TRecordFields& fields);

    TRecord fRecord;
    bool fHasTitle = false;
    bool fIsEnded = false;
    std::map<std::string, int> fDepths;                                                 // of the classes, by name
    std::function<void(const std::string&, const NKOLVRX20::TCIMValue&)> fSetQualifier; // of the element above
    boost::shared_ptr<NKOLVRX20::TInmemClass> fDeclared;
    boost::shared_ptr<NKOLVRX20::TInmemMethodDecl> fMethod;
    boost::shared_ptr<NKOLVRX20::TInmemProvider> fProvider;
    boost::shared_ptr<NKOLVRX20::TInmemClass> fServed;
    boost::shared_ptr<NKOLVRX20::TInmemInstance> fInstance;
    std::uint64_t fInstanceCount = 0; // of the class that is served
};

} // namespace vrxhost
