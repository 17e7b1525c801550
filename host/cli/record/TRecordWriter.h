// SPDX-License-Identifier: MIT
#pragma once

#include "host/cli/model/IModelObserver.h"
#include "host/cli/record/RecordForm.h"

#include <cstdio>
#include <memory>
#include <set>
#include <string>

namespace vrxhost {

// Writes a record while a namespace is collected. The record stands under its name only when it is whole: until then it
// is a file of another name beside it, mode 0600.
// What cannot be written (the disk is full) is reported by Finish; what cannot be recorded (a value that exceeds the
// form's limits) throws from the operation that met it, and the record goes on without.
// Thread: one at a time.
class TRecordWriter : public IModelObserver
{
  public:
    // Throws: std::runtime_error, a sentence, when the file cannot be made.
    TRecordWriter(const std::string& path, const TDocumentHead& head);
    // Removes what was not finished.
    ~TRecordWriter() override;

    void BeginProvider(const TProviderRecord& provider) override;
    // Writes the declarations of the class and of those above it, once each.
    // Throws: what the class throws; the class is recorded as far as it could be read.
    void BeginClass(NKOLVRX20::ICIMClass& each, const TClassRecord& record) override;
    // Throws: what the instance throws; it is left out then.
    void Add(const NKOLVRX20::ICIMInstance& instance) override;
    void EndClass(const TClassRecord& record) override;

    // Writes losses, notes and the last lines of the log, and gives the record its name.
    // Throws: std::runtime_error, a sentence.
    void Finish(const TDocument& document);

    static constexpr std::size_t kMaxLogBytes = 8u << 20; // of the host's log, its last ones

  private:
    struct TClose
    {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };

    void Declare(NKOLVRX20::ICIMClass& each, const std::string& name, int depth);
    void WriteLoss(const TLoss& loss);
    void WriteLog(const std::string& path);
    void Write(const std::string& lines);

    const std::string fPath;
    const std::string fTemporaryPath;
    std::unique_ptr<std::FILE, TClose> fFile;
    TRecordSum fSum;
    std::size_t fBytes = 0;
    std::size_t fBytesOfSum = 0; // at the last one
    std::set<std::string> fDeclared;
};

} // namespace vrxhost
