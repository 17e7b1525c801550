// SPDX-License-Identifier: MIT
// Whole requests through the server's reader, decoder, dispatcher and repository. An input is a sequence of requests,
// separated by lines of "====". The first two lines of each are the CIMMethod and CIMObject headers. The rest is a
// whole message if it begins with "<", else the parameters, one IPARAMVALUE each, after a line of their own that is
// dropped.
//
// Every request is answered, and the class that was there before is served unchanged after them.
#include "pegasus/repository/Repository.h"
#include "pegasus/server/net/RequestLoop.h"
#include "pegasus/server/operations/Dispatcher.h"
#include "tests/support/FuzzFolder.h"

#include <cstdint>
#include <cstdlib>
#include <sstream>
#include <string>

#include <sys/socket.h>

using namespace Pegasus;
using namespace Pegasus::server;

namespace {

constexpr std::size_t kMaxRequestBytes = 64u << 10; // what a socket pair buffers
constexpr char kSeparator[] = "\n====\n";

CIMProperty key(const char* name)
{
    CIMProperty property(CIMName(name), CIMValue(CIMTYPE_STRING, false));
    property.addQualifier(CIMQualifier(CIMName("Key"), CIMValue(Boolean(true))));
    return property;
}

void createClass(repository::Repository& repository, const char* nameSpace, const char* name, const char* keyName)
{
    CIMClass made{CIMName(name)};
    made.addProperty(key(keyName));
    made.addProperty(CIMProperty(CIMName("Text"), CIMValue(String("default"))));
    made.addProperty(CIMProperty(CIMName("Numbers"), CIMValue(CIMTYPE_UINT16, true)));
    repository.createClass(CIMNamespaceName(nameSpace), made);
}

// What every input starts from, so that short inputs reach far: the server's own classes, and a class with an instance.
void fill(const std::string& folder)
{
    repository::Repository repository(folder);
    for (const char* nameSpace : {"root/PG_Internal", "root/fuzz"}) {
        repository.createNamespace(CIMNamespaceName(nameSpace));
        CIMScope scope(CIMScope::PROPERTY);
        repository.setQualifier(CIMNamespaceName(nameSpace),
                                CIMQualifierDecl(CIMName("Key"), CIMValue(Boolean(false)), scope));
    }
    createClass(repository, "root/PG_Internal", "PG_ConfigSetting", "PropertyName");
    createClass(repository, "root/PG_Internal", "PG_ShutdownService", "Name");
    createClass(repository, "root/fuzz", "F", "Id");
    CIMInstance instance{CIMName("F")};
    instance.addProperty(CIMProperty(CIMName("Id"), CIMValue(String("1"))));
    repository.createInstance(CIMNamespaceName("root/fuzz"), instance);
}

ConnectionSettings settings()
{
    ConnectionSettings result;
    result.writeTimeout = std::chrono::milliseconds(1); // an answer that is larger than the buffer ends the connection
    result.strictHosts = true;
    return result;
}

// A server without sockets of its own, with the files of one input.
class FuzzedServer
{
  public:
    explicit FuzzedServer(const std::string& home)
        : fConfig(home), fRepository(home + "/repository"), fRegistry(fRepository),
          fAgents([] { return AgentSettings(); }), fCore{fConfig, fRepository, fRegistry, fAgents, [] {}},
          fDispatcher(fCore)
    {
    }

    // Returns: the bytes of the answer.
    std::string exchange(const std::string& bytes)
    {
        int ends[2];
        if (::socketpair(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0, ends) != 0) {
            std::abort();
        }
        const base::Descriptor client(ends[0]);
        {
            SocketStream stream{base::Descriptor(ends[1])};
            if (::send(client.get(), bytes.data(), bytes.size(), MSG_DONTWAIT) != static_cast<ssize_t>(bytes.size())) {
                return "HTTP/"; // larger than the buffer
            }
            ::shutdown(client.get(), SHUT_WR);
            serveConnection(stream, fDispatcher, settings, CimAnswer::Envelope::kMessage);
        }
        std::string answer(1u << 20, '\0');
        const ssize_t size = ::recv(client.get(), answer.data(), answer.size(), MSG_DONTWAIT);
        answer.resize(size > 0 ? static_cast<std::size_t>(size) : 0);
        return answer;
    }

  private:
    Config fConfig;
    repository::Repository fRepository;
    ProviderRegistry fRegistry;
    AgentPool fAgents;
    ServerCore fCore;
    Dispatcher fDispatcher;
};

std::string takeLine(std::string& text)
{
    const std::size_t end = std::min(text.find('\n'), text.size());
    std::string line = text.substr(0, end);
    text.erase(0, end + 1);
    return line;
}

std::string message(const std::string& method, const std::string& nameSpace, const std::string& parameters)
{
    std::string text = "<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM CIMVERSION=\"2.0\" DTDVERSION=\"2.0\">"
                       "<MESSAGE ID=\"1\" PROTOCOLVERSION=\"1.0\"><SIMPLEREQ><IMETHODCALL NAME=\"" +
                       method + "\"><LOCALNAMESPACEPATH>";
    std::istringstream names(nameSpace);
    for (std::string name; std::getline(names, name, '/');) {
        text += "<NAMESPACE NAME=\"" + name + "\"/>";
    }
    return text + "</LOCALNAMESPACEPATH>" + parameters + "</IMETHODCALL></SIMPLEREQ></MESSAGE></CIM>\n";
}

std::string requestOf(std::string text)
{
    const std::string method = takeLine(text);
    const std::string object = takeLine(text);
    if (text.empty() || text[0] != '<') {
        takeLine(text);
        text = message(method, object, text);
    }
    return "POST /cimom HTTP/1.1\r\nHost: localhost\r\nContent-Type: application/xml\r\nCIMOperation: MethodCall\r\n"
           "CIMMethod: " +
           method + "\r\nCIMObject: " + object + "\r\nContent-Length: " + std::to_string(text.size()) + "\r\n\r\n" +
           text;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static const test::FuzzFolder fgTemplate("repository", fill);
    if (size > kMaxRequestBytes) {
        return 0;
    }
    const std::string probe =
        requestOf("GetClass\nroot/fuzz\n\n<IPARAMVALUE NAME=\"ClassName\"><CLASSNAME NAME=\"F\"/></IPARAMVALUE>");
    const test::FuzzFolder home = fgTemplate.copy();
    FuzzedServer server(home.path());
    const std::string before = server.exchange(probe);
    std::string rest(reinterpret_cast<const char*>(data), size);
    while (!rest.empty()) {
        const std::size_t end = std::min(rest.find(kSeparator), rest.size());
        if (server.exchange(requestOf(rest.substr(0, end))).rfind("HTTP/", 0) != 0) {
            std::abort();
        }
        rest.erase(0, end + sizeof kSeparator - 1);
    }
    if (before.find("<CLASS NAME=\"F\"") == std::string::npos || server.exchange(probe) != before) {
        std::abort();
    }
    return 0;
}
