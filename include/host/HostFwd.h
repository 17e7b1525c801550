// Names that the host's interfaces share: forward declarations, the call context and the visitor shapes.
//
// Conventions of every interface in this folder:
// - Objects travel as boost::shared_ptr to the interface (or to its const form where noted).
// - The last argument of almost every operation is a TCIMContext, by value: named call options.
// - A visitor is called once per element and returns true to go on, false to stop.
// - Virtual operations are declared in the host's binary slot order, after the destructor. Order is contract.
// - Failures are thrown as TVRXException.
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

// Named values in byte order of their names: call options, method parameters, key bindings.
typedef std::map<std::string, TCIMValue> TCIMContext;

typedef boost::function<bool(boost::shared_ptr<ICIMClass>)> TClassVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMInstance>)> TInstanceVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMMethodDecl>)> TMethodDeclVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMParameterDecl>)> TParameterDeclVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMProperty>)> TPropertyVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMPropertyDecl>)> TPropertyDeclVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMQualifier>)> TQualifierVisitor;
typedef boost::function<bool(boost::shared_ptr<ICIMQualifierDecl>)> TQualifierDeclVisitor;
typedef boost::function<bool(boost::shared_ptr<IProvider>)> TProviderVisitor;
typedef boost::function<bool(const std::string*)> TKeyNameVisitor;

} // namespace NKOLVRX20
