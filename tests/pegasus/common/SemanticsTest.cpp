// The recorded answers of the real library: names, paths, values, date-times, objects, exceptions and their texts.
#include "tests/pegasus/common/VectorTable.h"

#include <Pegasus/Common/Exception.h>

#include <gtest/gtest.h>

#include <fstream>
#include <memory>

#include <cxxabi.h>

using namespace Pegasus;

namespace test {

std::string Vector::quoted() const
{
    const std::size_t begin = input.find('"');
    const std::size_t end = input.rfind('"');
    std::string out;
    for (std::size_t i = begin + 1; begin != std::string::npos && i < end; ++i) {
        const bool isEscape = input[i] == '\\' && i + 1 < end;
        const char c = isEscape ? input[++i] : input[i];
        out += isEscape && c == 'n' ? '\n' : (isEscape && c == 't' ? '\t' : c);
    }
    return out;
}

std::string Vector::lastWord() const
{
    return id.substr(id.rfind('.') + 1);
}

std::string utf8(const String& text)
{
    return std::string(text.getCString());
}

String text(const std::string& utf8)
{
    return String(utf8.data(), static_cast<Uint32>(utf8.size()));
}

json describe(const CIMValue& value)
{
    return {{"type", int(value.getType())},
            {"isArray", value.isArray()},
            {"isNull", value.isNull()},
            {"arraySize", value.getArraySize()},
            {"toString", std::string(value.toString().getCString())}};
}

json describe(const CIMObjectPath& path)
{
    static const char* const kTypes[] = {"BOOLEAN", "STRING", "NUMERIC", "REFERENCE"};
    json keys = json::array();
    for (Uint32 i = 0; i < path.getKeyBindings().size(); ++i) {
        const CIMKeyBinding& key = path.getKeyBindings()[i];
        keys.push_back({{"name", utf8(key.getName().getString())},
                        {"value", utf8(key.getValue())},
                        {"type", kTypes[key.getType()]}});
    }
    return {{"host", utf8(path.getHost())},
            {"namespace", utf8(path.getNameSpace().getString())},
            {"class", utf8(path.getClassName().getString())},
            {"keys", keys},
            {"toString", utf8(path.toString())}};
}

json describe(const CIMDateTime& dateTime)
{
    return {{"toString", utf8(dateTime.toString())},
            {"isInterval", dateTime.isInterval()},
            {"usec", dateTime.toMicroSeconds()}};
}

namespace {

// Real answers that are faults, where ours differ.
const std::map<std::string, const char*>& notImitated()
{
    static const std::map<std::string, const char*> table = {
        {"uninit.CIMClass.clone()", "crashes; here: UninitializedObjectException"},
        {"uninit.CIMInstance.clone()", "crashes; here: UninitializedObjectException"},
    };
    return table;
}

VectorTable allEvaluators()
{
    VectorTable table;
    addNameVectors(table);
    addPathVectors(table);
    addDateTimeVectors(table);
    addExceptionVectors(table);
    addStringVectors(table);
    addFlagVectors(table);
    addValueVectors(table);
    addObjectVectors(table);
    return table;
}

// By the whole id, else by its longest beginning.
const Evaluator* findEvaluator(const VectorTable& table, const std::string& id)
{
    for (std::string key = id; !key.empty();) {
        const auto found = table.find(key);
        if (found != table.end()) {
            return &found->second;
        }
        key.pop_back();
        key.erase(key.find_last_of('.') + 1);
    }
    return nullptr;
}

json evaluate(const Evaluator& evaluator, const Vector& vector)
{
    try {
        return {{"value", evaluator(vector)}};
    } catch (const Exception& exception) {
        const std::unique_ptr<char, decltype(&std::free)> name(
            abi::__cxa_demangle(typeid(exception).name(), nullptr, nullptr, nullptr), &std::free);
        json result = {{"throws", name.get()}, {"message", utf8(exception.getMessage())}};
        if (const auto* status = dynamic_cast<const CIMException*>(&exception)) {
            result["code"] = int(status->getCode());
        }
        return result;
    }
}

} // namespace

TEST(Semantics, EveryRecordedAnswerIsGivenHereToo)
{
    const std::string folder = VRX_VECTORS_DIR;
    if (folder.empty()) {
        GTEST_SKIP() << "no recorded answers: configure with -DVRX_VECTORS_DIR=<folder>";
    }
    const json vectors = json::parse(std::ifstream(folder + "/semantics.json"));
    const VectorTable table = allEvaluators();
    std::size_t passed = 0;
    for (const json& entry : vectors) {
        const Vector vector{entry.at("id"), entry.at("input")};
        if (notImitated().count(vector.id)) {
            continue;
        }
        const Evaluator* evaluator = findEvaluator(table, vector.id);
        if (!evaluator) {
            ADD_FAILURE() << "no evaluator for " << vector.id << ": " << vector.input;
            continue;
        }
        const json actual = evaluate(*evaluator, vector);
        EXPECT_EQ(actual, entry.at("expected")) << vector.id << ": " << vector.input;
        passed += actual == entry.at("expected") ? 1 : 0;
    }
    std::printf("counted: %zu of %zu recorded answers of the library are given here too; %zu are listed as faults\n",
                passed, vectors.size(), notImitated().size());
}

} // namespace test
