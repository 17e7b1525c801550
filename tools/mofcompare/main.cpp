// SPDX-License-Identifier: MIT
#include "pegasus/base/Text.h"
#include "pegasus/mof/Compiler.h"
#include "pegasus/mof/MemoryHandler.h"
#include "tools/mofcompare/ClassComparison.h"

#include <Pegasus/Client/CIMClient.h>

#include <iostream>
#include <stdexcept>

// Compares what a server holds with the MOF file that was compiled into it, element by element.
//
//   mofcompare NAMESPACE FILE          through the server's local socket below $PEGASUS_HOME
//   mofcompare NAMESPACE FILE PORT     through 127.0.0.1:PORT
//
// Exit status: 0 all equal, 1 differences (one line each on standard output), 2 the comparison failed.

using namespace Pegasus;

namespace {

class Report
{
  public:
    void add(const std::vector<std::string>& lines)
    {
        fCount += lines.size();
        for (const std::string& line : lines) {
            std::cout << line << "\n";
        }
    }
    std::size_t count() const { return fCount; }

  private:
    std::size_t fCount = 0;
};

void connect(CIMClient& client, int argc, char** argv)
{
    if (argc > 3) {
        client.connect(String("127.0.0.1"), static_cast<Uint32>(std::stoul(argv[3])), String(), String());
    } else {
        client.connectLocal();
    }
}

int compareAll(int argc, char** argv)
{
    const CIMNamespaceName nameSpace(argv[1]);
    mof::MemoryHandler source;
    mof::CompileOptions options;
    options.nameSpace = nameSpace;
    options.allowExperimental = true;
    mof::compileFile(argv[2], options, source);

    CIMClient client;
    connect(client, argc, argv);
    Report report;
    for (const auto& [key, declaration] : source.qualifiers()) {
        report.add(mofcompare::differences(declaration, client.getQualifier(nameSpace, declaration.getName())));
    }
    const auto lookup = [&source](const CIMName& name, CIMQualifierDecl& found) {
        return source.findQualifier(name, found);
    };
    for (const CIMClass& declared : source.classes()) {
        report.add(mofcompare::differences(declared, client.getClass(nameSpace, declared.getClassName()), lookup));
    }
    std::cout << source.qualifiers().size() << " qualifier declarations and " << source.classes().size()
              << " classes compared, " << report.count() << " differences\n";
    return report.count() == 0 ? 0 : 1;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3 && argc != 4) {
        std::cerr << "Usage: mofcompare NAMESPACE FILE [PORT]\n";
        return 2;
    }
    try {
        return compareAll(argc, argv);
    } catch (const mof::MofError& error) {
        std::cerr << error.diagnostic();
    } catch (const Exception& error) {
        std::cerr << "mofcompare: " << base::utf8(error.getMessage()) << "\n";
    } catch (const std::exception& error) {
        std::cerr << "mofcompare: " << error.what() << "\n";
    }
    return 2;
}
