// SPDX-License-Identifier: MIT
#pragma once

#include "src/common/ClientConnection.h"
#include "src/namespace/ServerTree.h"
#include "src/schema/NamedMap.h"
#include "src/schema/QualifierValues.h"

#include <host/ICIMNamespace.h>

#include <boost/enable_shared_from_this.hpp>
#include <boost/shared_ptr.hpp>
#include <boost/weak_ptr.hpp>

#include <map>
#include <string>
#include <vector>

namespace Pegasus {
class CIMClass;
}

namespace NKOLVRX20 {

class TPEGASUSClass;
class TPEGASUSProvider;
class TPEGASUSQualifierDecl;

// The host's view of "root/cimv2" as a private CIM server of our own serves it.
//
// The object owns that server: Initialize starts it, the destructor stops it and removes its repository. It is the
// cache of all classes fetched so far and the list of the vendor providers.
//
// Two directories matter and may differ: the root directory R (the process's working directory at construction: the
// server's programs and repository) and the module path (the plug-in's own directory: base schema and provider tree).
//
// Ownership: always held by boost::shared_ptr. Owns the client, the providers and the classes; classes point back
// weakly. The destructor also takes apart the cycles between providers and their classes.
// Thread: one at a time. Threads of its own exist only inside FindProviders and EnumerateProviders.
class TPEGASUSNamespace : public ICIMNamespace,
                          public TClientOwner,
                          public boost::enable_shared_from_this<TPEGASUSNamespace>
{
  public:
    // Reads "repository" and "upcall" from the context; Initialize starts the server.
    TPEGASUSNamespace(TCIMContext context, std::string name);
    // Every step that fails is logged, and the next one still runs.
    // Blocks: for the server's stop command, and three seconds.
    ~TPEGASUSNamespace() override;

    TPEGASUSNamespace(const TPEGASUSNamespace&) = delete;
    TPEGASUSNamespace& operator=(const TPEGASUSNamespace&) = delete;

    // --- ICIMNamespace, in slot order ---

    boost::shared_ptr<INamespaceProvider> GetNamespaceProvider(TCIMContext context) override;
    void SetUpcallNamespace(boost::shared_ptr<ICIMNamespace> upcall, TCIMContext context) override;
    // Throws: TVRXException 31, always.
    void AddUnderlyingNamespace(boost::shared_ptr<ICIMNamespace> underlying, TCIMContext context) override;
    // Returns: null, always: the host's generic allocation is unsupported.
    boost::shared_ptr<ICIMClass> AllocateClass(const std::string& name, boost::shared_ptr<ICIMClass> superClass,
                                               TCIMContext context) override;
    // Returns the cached class of that name, or fetches it from the server with its chain of superclasses, top-down.
    // The context's "nsp" names the server namespace, "timeout" the class's timeout in seconds, both as strings.
    // Returns: null when unconnected, for an empty name, and when fetching the class fails.
    // Throws: TVRXException 25 (invalid name), 14 (wrong type of "nsp" or "timeout");
    // Pegasus::UninitializedObjectException when the server's answer was a malformed HTTP message.
    // Blocks: 5 seconds for each request to a silent server.
    boost::shared_ptr<ICIMClass> GetClass(const std::string& name, TCIMContext context) override;
    // Visits the whole class tree below the root class, depth-first; returns at once when unconnected.
    void EnumerateRootClasses(TClassVisitor visitor, TCIMContext context) override;
    // Visits the providers if the context's "pluginType" is 7 or absent; on a thread for each when the host's
    // "pegasus_multi_thread" is "on", and the visitor's results are ignored then.
    // Throws: TVRXException 14 when "pluginType" has a type other than sint8; what the visitor throws on the calling
    // thread; boost::thread_resource_error, after the threads that run have ended.
    void EnumerateProviders(TProviderVisitor visitor, TCIMContext context) override;
    // Returns: a declaration owned by this namespace; AddQualifierDecl adds it.
    boost::shared_ptr<ICIMQualifierDecl> AllocateQualifierDecl(const std::string& name, TCIMValue defaultValue,
                                                               ICIMQualifierDecl::EScope scope,
                                                               ICIMQualifierDecl::EFlavor flavor,
                                                               TCIMContext context) override;
    // Asks the upcall namespace. Throws: boost::bad_weak_ptr when it is absent.
    boost::shared_ptr<ICIMQualifierDecl> GetQualifierDecl(const std::string& name, TCIMContext context) override;
    // Visits this namespace's own declarations in byte order of their normalised names.
    void EnumerateQualifierDecls(TQualifierDeclVisitor visitor, TCIMContext context) override;
    // Throws: TVRXException 1, always.
    void Subscribe(boost::shared_ptr<ICIMIndicationFilter> filter, TInstanceVisitor visitor,
                   TCIMContext context) override;
    // Returns: null also when GetClass returns null for the reference's class.
    boost::shared_ptr<ICIMInstance> GetInstance(const TCIMReference& reference, TCIMContext context) override;
    // Handed to the repository namespace. Throws: TVRXException 31 when it is absent.
    void DeleteInstance(const TCIMReference& reference, TCIMContext context) override;
    void ModifyInstance(const TCIMReference& reference, TCIMContext values, TCIMContext context) override;
    void ExecuteQuery(TInstanceVisitor visitor, std::string& language, std::string& query,
                      TCIMContext context) override;
    // Returns at once: no instances are kept here.
    void ClearInstances() override;

    // --- slots of its own ---

    // Builds and initialises a class; AddClass enters it into the cache. A null superclass means the root class.
    // Throws: what the class's initialisation throws.
    virtual boost::shared_ptr<ICIMClass> AllocateClass(const std::string& name, const std::string& cimNamespace,
                                                       const std::string& timeout,
                                                       boost::shared_ptr<ICIMClass> superClass, TCIMContext& context);
    // Leaves this object as it is.
    virtual ICIMNamespace& operator=(const ICIMNamespace& other);

    // Returns: the name that it was built with.
    const std::string& GetName() const { return fName; }

    // --- start-up ---

    // Starts a server and connects, with up to six attempts; then builds the root class, compiles the base schema and
    // prepares the vendors. If the last attempt fails too, it goes on unconnected.
    // Throws: TVRXException 3 (unsafe directory or consumer name: nothing is started or removed),
    // 12 (a program fails to run or times out).
    void Initialize(TCIMContext context);
    // Finds the providers on disk, compiles their MOF files (on a thread for each when "pegasus_multi_thread" is
    // "on"), collects their classes and connects each.
    // Throws: TVRXException 11, 12, 42, 25; boost::thread_resource_error; Pegasus::UninitializedObjectException.
    void FindProviders();
    // Writes the server's provider directories and the vendors' own configuration files.
    void preConfig();
    // Returns: the working directory; empty when it is unreadable or longer than 1023 bytes.
    static std::string GetVRXRootPath();
    // Returns: the namespace of the host. Throws: boost::bad_weak_ptr when it is gone or unset.
    boost::shared_ptr<ICIMNamespace> GetUpcallNamespace() const;

    // --- the server as a process ---

    // Returns: 5988, or else the highest free port. Ends the process with status 1 when all above 1023 are taken.
    // Throws: TVRXException 42 when making the socket fails.
    unsigned short getAvailablePort();
    void callCimconfig();
    void callCimserver(unsigned short port);
    bool isResidualCimserver(int pid);
    void killResidualCimserver();
    int teminateCimserver(int pid);
    void closeCimserver(bool stopFirst);
    void cleanCimserver();
    void cleanup();

    // --- the connection ---

    void Init();
    void connect(const std::string& host, unsigned short port, const std::string& user, const std::string& password);

    // --- MOF ---

    // Compiles one file; a failed compilation shows only in the log.
    void callCimmof(const std::string& cimNamespace, const std::string& mofPath);
    // Returns: the paths of the directory's entries whose names contain the pattern, in the directory's order.
    std::vector<std::string> FindMofFiles(const std::string& directory, const std::string& pattern);
    // The same for the directory that holds the path. Throws: TVRXException 3 when the path lacks a directory part.
    std::vector<std::string> BuildMofPath(const std::string& path, const std::string& pattern);

    // --- providers ---

    // Returns: the paths root/vendor/file of all files whose names contain the extension, in byte order.
    // Throws: TVRXException 11 when opening the root or a vendor directory fails.
    std::vector<std::string> FindXmlFiles(const std::string& root, const std::string& extension);
    // Returns: the names of the immediate subdirectories, in the directory's order; empty when opening it fails.
    std::vector<std::string> FindSubDirs(const std::string& directory);
    // Reads one requested-class file. An unreadable one leaves the outputs as they are.
    // Throws: TVRXException 4 when memory is short or the file is larger than kMaxRequestedClassFileBytes.
    void parseProvider(const std::string& path, std::vector<std::string>& classes,
                       std::map<std::string, std::string>& information);
    void prepareRegProvider(const std::string& path);
    void filterProviders(std::vector<std::string>& paths);
    // Splits "Class[seconds]%^tag^%". Returns: the class name; "TimeOut" and "Tag" go into the tags where given.
    std::string filterTag4classes(const std::string& entry, std::map<std::string, std::string>& tags);
    void regProvider(std::string path, boost::shared_ptr<TPEGASUSProvider> provider);
    void finishRegProvider(std::string path, boost::shared_ptr<TPEGASUSProvider> provider);
    void undoProvidersSetup();
    std::vector<boost::shared_ptr<TPEGASUSProvider>>& GetProvidersContainer() { return fProviders; }

    // --- schema cache ---

    // Returns: the lower-cased name, the key of every map of named elements; an empty name stays empty.
    // Throws: TVRXException 25, after a log line, for an invalid name.
    static std::string NormalizeName(const std::string& name);
    // Throws, after a log line: TVRXException 16 when one of that name is there and redefinition is off, 14 for null.
    void AddClass(boost::shared_ptr<TPEGASUSClass> newClass);
    void AddQualifierDecl(boost::shared_ptr<TPEGASUSQualifierDecl> declaration);
    // Returns: this namespace's own declaration; null when absent. Throws: TVRXException 25.
    boost::shared_ptr<TPEGASUSQualifierDecl> FindQualifierDecl(const std::string& name) const;
    // Returns: the values that the classes share.
    TQualifierValues& GetQualifierValues() { return fQualifierValues; }
    // Returns: the class "<root>"; null before Initialize.
    boost::shared_ptr<TPEGASUSClass> GetRootClass() const { return fRootClass; }
    // Whether AddClass and AddQualifierDecl replace what is there; off at first.
    void SetAllowRedefinition(bool allow) { fAllowRedefinition = allow; }

  private:
    void RefuseUnsafeNames();
    void StartServerAndConnect();
    bool TryToStartServer(int attempt);
    void CreateRootClass();
    void CompileBaseSchema();
    void WriteLsiConfiguration() const;

    void StopCimserver();
    void ReleaseCycles();

    void RegisterProviders();
    boost::shared_ptr<ICIMClass> CollectClass(const std::string& entry,
                                              const boost::shared_ptr<TPEGASUSProvider>& provider);

    // The operation and its object are for the log. Throws: TVRXException 31 when that namespace is absent.
    ICIMNamespace& RepositoryNamespace(const char* operation, const std::string& object) const;

    bool AskServerForClass(const std::string& cimNamespace, const std::string& name, Pegasus::CIMClass& answer);
    boost::shared_ptr<ICIMClass> FetchClass(const std::string& name, const TCIMContext& context);
    bool MirrorClass(const Pegasus::CIMClass& source, const TCIMContext& callerContext, TCIMContext& classContext);

    const std::string fName;
    const TServerTree fTree;
    const std::string fHostAddress;
    unsigned short fPort;
    std::string fConsumerName;
    bool fRefused; // an unsafe root directory or consumer name: nothing may be removed or started
    boost::shared_ptr<ICIMNamespace> fRepositoryNamespace;
    boost::weak_ptr<ICIMNamespace> fUpcallNamespace;
    boost::shared_ptr<TPEGASUSClass> fRootClass;
    std::vector<boost::shared_ptr<TPEGASUSProvider>> fProviders; // in discovery order
    TNamedMap<TPEGASUSClass> fClasses;
    TNamedMap<TPEGASUSQualifierDecl> fQualifierDecls;
    TQualifierValues fQualifierValues;
    bool fAllowRedefinition = false;
    unsigned int fSuperClassDepth = 0; // of the chain that GetClass is following
};

} // namespace NKOLVRX20
