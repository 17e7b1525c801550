// SPDX-License-Identifier: MIT
// The contract between a system-inventory host and its namespace-provider plug-ins: the rules that hold for every
// header of this folder, and the names that the headers share.
//
// Who provides what
//   The plug-in implements INamespaceProvider, ICIMNamespace, IProvider, ICIMClass, the declaration interfaces
//   (ICIMPropertyDecl, ICIMMethodDecl, ICIMParameterDecl, ICIMQualifier, ICIMQualifierDecl) and ICIMProperty, and
//   derives its instances from the host's TInmemInstance.
//
//   The host provides TRootObject with its ILogger and INamespaceProviderManager, TConfig, TOSSpecific, TXmlParser,
//   TInmemInstance, the value classes (TCIMValue, TCIMReference, TCIMDateTime, TCIMChar16) and TVRXException. Each of
//   these headers says what another host's implementation must keep.
//
//   "Here:" begins what libpegasus.nsp.so does where another plug-in may do something else.
//
// Slots
//   Virtual operations are declared in the host's binary slot order, after the destructor. The order is part of the
//   contract: every operation keeps its place.
//
// Ownership
//   Objects travel as boost::shared_ptr. Every pointer argument and every returned pointer refers to an object; where
//   null is possible, the operation says so. An owner keeps what is below it alive (a namespace its classes, a class
//   its declarations); the way back is weak. A host may therefore keep a class or an instance longer than its
//   namespace: names, declarations and fetched values stay readable; an operation that needs the namespace throws
//   boost::bad_weak_ptr or returns null, as it says. Every object that a plug-in made must be released before the
//   plug-in's library is unloaded.
//
// Context
//   The last argument of almost every operation is a TCIMContext, by value: named call options. An operation reads the
//   keys that its comment names and ignores all others. The keys, their types and their defaults:
//     key          type      default        read by
//     consumer     any       "quvex"        INamespaceProvider::AllocateNamespace: whose server this is
//     repository   kUint64   (absent)       INamespaceProvider::AllocateNamespace: address of a shared pointer
//     upcall       kUint64   (absent)       INamespaceProvider::AllocateNamespace: address of a shared pointer
//     nsp          kString   "root/cimv2"   ICIMNamespace::GetClass and GetInstance: the server's CIM namespace
//     timeout      kString   "60"           ICIMNamespace::GetClass and GetInstance: decimal seconds
//     pluginType   kSint8    (absent)       ICIMNamespace::EnumerateProviders: 7 asks for providers of this kind
//
// Names
//   Names of classes, properties, methods, parameters and qualifiers are looked up ignoring case. A name is an
//   underscore or letter, then underscores, letters and digits; a look-up of any other name throws TVRXException 25.
//   Enumerations of named elements run in byte order of the lower-cased names. Comparison operators between elements
//   compare names byte for byte, case included.
//
// Visitors
//   A visitor is called once per element, on the calling thread, and returns true to go on or false to stop. It may
//   call back into the object that it was called from, and it may release that object and its namespace: the walk runs
//   on a copy. An exception of the visitor leaves the operation. Operations that differ in one of these points say so.
//
// Failures
//   An operation that fails throws TVRXException; its status code is the only datum (codes and names:
//   TVRXStatusCode.h). Other kinds can leave as well: boost::bad_weak_ptr (the namespace or another owner is gone),
//   Pegasus::Exception and its subclass Pegasus::CIMException (of the CIM client library; unrelated to std::exception),
//   and what the host's own services throw. Each operation lists what leaves it; std::bad_alloc may always leave. A
//   host that is to survive every failure ends its handlers with catch (...).
//
// Threads
//   One thread at a time drives a namespace and everything that came from it. A plug-in's operations are unguarded:
//   the host serialises them. With the host's setting "pegasus_multi_thread" = "on",
//   INamespaceProvider::AllocateNamespace and ICIMNamespace::EnumerateProviders use threads of their own, which have
//   ended when the operation returns.
//
// Blocking
//   An operation's "Blocks:" states how long it may wait for a server or a program; an operation that lacks it works
//   in memory. A visitor's own time comes on top.
#pragma once

#include <boost/function.hpp>
#include <boost/shared_ptr.hpp>

#include <map>
#include <string>
#include <vector>

namespace NKOLVRX20 {

class ICIMClass;
class ICIMElement;
class ICIMIndicationFilter;
class ICIMInstance;
class ICIMMethodDecl;
class ICIMNamedElement;
class ICIMNamespace;
class ICIMParameterDecl;
class ICIMProperty;
class ICIMPropertyDecl;
class ICIMQualifier;
class ICIMQualifierDecl;
class ILogger;
class INamespaceProvider;
class INamespaceProviderManager;
class IProvider;
class TCIMReference;
class TCIMValue;

// Named values in byte order of their names: call options, method parameters, key bindings. Unlike names of elements,
// the keys are compared byte for byte.
using TCIMContext = std::map<std::string, TCIMValue>;

using TClassVisitor = boost::function<bool(boost::shared_ptr<ICIMClass>)>;
using TInstanceVisitor = boost::function<bool(boost::shared_ptr<ICIMInstance>)>;
using TMethodDeclVisitor = boost::function<bool(boost::shared_ptr<ICIMMethodDecl>)>;
using TParameterDeclVisitor = boost::function<bool(boost::shared_ptr<ICIMParameterDecl>)>;
using TPropertyVisitor = boost::function<bool(boost::shared_ptr<ICIMProperty>)>;
using TPropertyDeclVisitor = boost::function<bool(boost::shared_ptr<ICIMPropertyDecl>)>;
using TQualifierVisitor = boost::function<bool(boost::shared_ptr<ICIMQualifier>)>;
using TQualifierDeclVisitor = boost::function<bool(boost::shared_ptr<ICIMQualifierDecl>)>;
using TProviderVisitor = boost::function<bool(boost::shared_ptr<IProvider>)>;
using TKeyNameVisitor = boost::function<bool(const std::string*)>;

} // namespace NKOLVRX20
