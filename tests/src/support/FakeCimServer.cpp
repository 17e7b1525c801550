// SPDX-License-Identifier: MIT
#include "tests/src/support/FakeCimServer.h"

#include "tests/support/PeerAnswers.h"

#include <algorithm>

namespace NKOLVRX20 {

namespace {

std::string QualifierIn(const std::string& body)
{
    const std::string before = "<VALUE>";
    const auto start = body.find(before) + before.size();
    return body.substr(start, body.find("</VALUE>", start) - start);
}

} // namespace

std::string RequestName(const test::PeerRequest& request)
{
    const std::string operation = request.method();
    return operation + " " + (operation == "GetQualifier" ? QualifierIn(request.body) : request.nameIn("CLASSNAME"));
}

TFakeCimServer::TFakeCimServer()
    : fPeer([this](const test::PeerRequest& request) { return Respond(request); }, test::ScriptedPeer::Start::kRefusing)
{
}

void TFakeCimServer::Answer(const std::string& request, const std::string& returnValue)
{
    AnswerWith(request, [returnValue](const test::PeerRequest& asked) {
        return test::httpAnswer(test::intrinsicBody(asked, returnValue));
    });
}

void TFakeCimServer::AnswerClass(const std::string& name, const std::string& superClass, const std::string& elements)
{
    const std::string super = superClass.empty() ? "" : " SUPERCLASS=\"" + superClass + "\"";
    Answer("GetClass " + name, "<CLASS NAME=\"" + name + "\"" + super + ">" + elements + "</CLASS>");
}

void TFakeCimServer::AnswerWith(const std::string& request, test::PeerHandler handler)
{
    const std::lock_guard<std::mutex> lock(fMutex);
    fHandlers[request] = std::move(handler);
}

std::vector<std::string> TFakeCimServer::Requests() const
{
    std::vector<std::string> names;
    for (const test::PeerRequest& request : fPeer.requests()) {
        names.push_back(RequestName(request));
    }
    return names;
}

long TFakeCimServer::Count(const std::string& request) const
{
    const std::vector<std::string> names = Requests();
    return std::count(names.begin(), names.end(), request);
}

std::vector<std::string> TFakeCimServer::Bodies(const std::string& request) const
{
    std::vector<std::string> bodies;
    for (const test::PeerRequest& asked : fPeer.requests()) {
        if (RequestName(asked) == request) {
            bodies.push_back(asked.body);
        }
    }
    return bodies;
}

test::PeerAnswer TFakeCimServer::Respond(const test::PeerRequest& request)
{
    test::PeerHandler handler;
    {
        const std::lock_guard<std::mutex> lock(fMutex);
        const auto scripted = fHandlers.find(RequestName(request));
        if (scripted != fHandlers.end()) {
            handler = scripted->second;
        }
    }
    return handler ? handler(request) : test::errorAnswer(request, 6, "CIM_ERR_NOT_FOUND: not in the script");
}

} // namespace NKOLVRX20
