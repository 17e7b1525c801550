// SPDX-License-Identifier: MIT
#pragma once

#include <host/HostFwd.h>
#include <host/TCIMValue.h>

namespace NKOLVRX20 {

// The entry object of a plug-in: it makes namespaces of one kind. The plug-in registers it with the host's
// INamespaceProviderManager when the host calls the plug-in's Initialize (PluginSymbols.h).
// Thread: the host allocates and clears namespaces from one thread.
class INamespaceProvider
{
  public:
    virtual ~INamespaceProvider() = default;

    // Returns: the kind of namespace, which is also the name that the host's manager knows the provider by.
    // Here: "pegasus".
    virtual std::string GetName(TCIMContext context) const = 0;
    // Makes a namespace and brings it into service.
    // Here: the namespace is "root/cimv2" whatever the name says; create is ignored. The call works in the process's
    // working directory R, which it reads once: it deletes R/pegasus/repository, starts R/pegasus/bin/cimserver,
    // connects, compiles the base schema and the vendors' MOF and fetches the requested classes. Starting and
    // connecting is tried six times at most. After the sixth failure the call goes on unconnected: it throws 42 when it
    // comes to the first vendor, and returns an unconnected namespace where vendors are absent.
    //
    // The new namespace replaces the plug-in's current one at once, and stays the current one when the call fails;
    // ClearNamespace (PluginSymbols.h) releases it. Release every pointer into an earlier namespace before: two
    // namespaces of one consumer stop each other's server, and the end of one that is still held deletes the repository
    // of the next.
    //
    // Context:
    //   consumer    Whose server this is, as text. The server writes its process id into
    //               /var/tmp/cimserverkol_tc_<consumer>_start.conf, by its own planned configuration: set it once with
    //               R/pegasus/bin/cimconfig -s consumer=NAME -p, and pass the same NAME here. A server that an earlier
    //               host left behind is found and killed by that file.
    //   repository  Address of a boost::shared_ptr<ICIMNamespace>, as kUint64. A copy is kept for the namespace's life;
    //               it serves DeleteInstance, ModifyInstance and ExecuteQuery.
    //   upcall      The same; kept weakly; it serves GetQualifierDecl.
    //   The pointed-to pointers must live until the call returns. A value of another type counts as absent.
    // Throws: TVRXException
    //   3   the working directory or the consumer holds a character that a shell reads (a blank, a control character,
    //       one of " ' \ ` $ & | ; < > ( ) * ? [ ] { } ! # ~, in the consumer also /); nothing was removed or started
    //   11  the plug-in's folder has no readable pegasus/provider, or a vendor's folder in it cannot be read
    //   12  a program failed to run, or ran out of time
    //   25  a *.classes.xml names a class by an invalid CIM name
    //   42  no connection
    // Pegasus::UninitializedObjectException as ICIMNamespace::GetClass; boost::thread_resource_error.
    // Ends the process with exit(1), and leaves the log as it is, when no TCP port from 65535 down to 1024 can be bound
    // on 127.0.0.1. A host that wants to report that needs an exit handler.
    // Blocks: at least 4 seconds for each start attempt, then as long as the programs run (the process service is given
    // 32767 seconds each), and 5 seconds for each request to a silent server.
    virtual boost::shared_ptr<ICIMNamespace> AllocateNamespace(TCIMContext context, bool create,
                                                               std::string name) const = 0;
    // Returns: a number for the host's own use. Here: 0.
    virtual int GetType(TCIMContext context) const = 0;
    // Returns: whether ICIMNamespace::Subscribe works. Here: false.
    virtual bool IsIndicationsSupported(TCIMContext context) const = 0;
};

} // namespace NKOLVRX20
