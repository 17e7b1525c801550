// SPDX-License-Identifier: MIT
// From the contract's objects to records, and from what a user types to values.
#pragma once

#include "host/cli/model/Document.h"

#include <host/ICIMClass.h>
#include <host/ICIMInstance.h>
#include <host/ICIMNamedElement.h>
#include <host/ICIMNamespace.h>

namespace vrxhost {

// Fills in superclasses, qualifiers, properties and methods.
// Throws: what the class throws; what was read before stays.
void ReadDeclarations(NKOLVRX20::ICIMClass& from, TClassRecord& into);

// Throws: what the instance throws.
TInstanceRecord ReadInstance(const NKOLVRX20::ICIMInstance& instance);

// Returns: a value and its text, made from the qualifiers of the element that declares it, which may be null.
TPropertyRecord ReadValue(const std::string& name, const NKOLVRX20::TCIMValue& value,
                          const NKOLVRX20::ICIMNamedElement* declaration);

// Makes a value of a declared type from what a user typed: numbers in decimal, true and false, a datetime's 25
// characters, an object path; the elements of an array are separated by commas.
// ns: what a reference refers to.
// Throws: TRequestError for a text of another type or a number out of range.
NKOLVRX20::TCIMValue ParseValue(const std::string& text, NKOLVRX20::TCIMValue::TCIMType type,
                                const boost::shared_ptr<NKOLVRX20::ICIMNamespace>& ns);

} // namespace vrxhost
