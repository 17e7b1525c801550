// SPDX-License-Identifier: MIT
// The form of a record: text in lines, so that it is written while it is collected, and a reader knows the place of a
// fault. A line is a word and fields, separated by tabs:
//
//   vrxhost record   1
//   host             NAME MACHINE-ID PRODUCT SERIAL
//   run              ID STARTED PROGRAM-VERSION
//   class            NAME SUPERCLASS                      the superclass stands before; empty at the top
//     property       NAME TYPE [key]
//     method         NAME TYPE
//       parameter    NAME TYPE
//     qualifier      NAME VALUE                           of the class, property, method or parameter above
//   provider         NAME MODULE DESCRIPTION
//     serves         CLASS                                then that class's instances
//       instance     PATH
//         value      NAME VALUE
//     served         COUNT MILLISECONDS
//   loss             FLAGS BEGIN END VENDOR FILE PROPERTY  flags: note, cause, consequence, kind:WORD, each and a blank
//     about          provider|object|class|log TEXT
//   log              LINE                                 of the host's log
//   sum              SUM                                  of all bytes before, at intervals
//   end              complete|partial ENDED SUM
//
// Indentation is of this comment only. A VALUE is the type's name and a field with the text, as TCIMValue reads it; a
// null is the field \N; "[]" after the name makes an array with a field for each element. Tabs, control bytes and
// backslashes are escapes in a field (\t, \n, \\, \xHH), all other bytes stand as they are.
//
// The interfaces of the contract are recorded, and reading makes a namespace of the host's own classes in memory: every
// command works on it as on a plug-in's. The document's model would lose qualifiers and types, and would need a second
// way through each command.
#pragma once

#include <host/TCIMValue.h>

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace vrxhost {

constexpr char kRecordTitle[] = "vrxhost record";
constexpr int kRecordVersion = 1;
constexpr char kKindFlag[] = "kind:"; // goes before the word of a loss's kind

constexpr std::size_t kMaxRecordBytes = 256u << 20;
constexpr std::size_t kMaxRecordLineBytes = 16u << 20;
constexpr std::size_t kMaxRecordElements = 1u << 20; // of an array
constexpr int kMaxRecordedSuperclasses = 128;        // of a class

// Returns: one field.
std::string RecordField(std::string_view text);

// Returns: the fields of a value.
// Throws: std::length_error for an array that a record cannot hold.
std::string RecordValue(const NKOLVRX20::TCIMValue& value);

// Takes a line apart from the left.
class TRecordFields
{
  public:
    explicit TRecordFields(std::string_view line) : fRest(line) {}

    bool HasMore() const { return fHasMore; }

    // Returns: the next field with its escapes resolved.
    // Throws: std::runtime_error, a sentence, when there is none or an escape is unknown.
    std::string Next();
    NKOLVRX20::TCIMValue NextValue();
    NKOLVRX20::TCIMValue::TCIMType NextType(); // an array's code for an array
    std::uint64_t NextNumber();

  private:
    std::string_view NextRaw();
    NKOLVRX20::TCIMValue NextScalar(NKOLVRX20::TCIMValue::TCIMType type);
    NKOLVRX20::TCIMValue NextArray(NKOLVRX20::TCIMValue::TCIMType type);

    std::string_view fRest;
    bool fHasMore = true;
};

// The sum of a record's bytes (FNV-1a): finds damage, and protects from nobody.
class TRecordSum
{
  public:
    void Add(std::string_view bytes);
    std::string GetText() const; // 16 hexadecimal digits

  private:
    std::uint64_t fSum = 14695981039346656037u;
};

} // namespace vrxhost
