// SPDX-License-Identifier: MIT
#include "host/cli/formats/JsonWriter.h"

#include <utility>

namespace vrxhost {
namespace {

constexpr int kIndent = 2;

} // namespace

// A line feed in the text of a value is always one of the layout: those of strings are escaped.
void TJsonWriter::Add(const std::string& name, const TJson& value)
{
    BeginItem(name);
    const std::string text = JsonText(value, kIndent);
    const std::string newLine = NewLine();
    for (std::size_t begin = 0; begin < text.size();) {
        const std::size_t end = text.find('\n', begin);
        fText.append(begin == 0 ? "" : newLine).append(text, begin, end - begin);
        begin = end + 1;
    }
}

void TJsonWriter::AddMembers(const TJson& object)
{
    for (const auto& [name, value] : object.items()) {
        Add(name, value);
    }
}

void TJsonWriter::CloseTo(std::size_t depth)
{
    while (fOpen.size() > depth) {
        const TOpen last = fOpen.back();
        fOpen.pop_back();
        fText += (last.fIsEmpty ? "" : NewLine()) + last.fEnd;
    }
}

std::string TJsonWriter::Take()
{
    return std::exchange(fText, "");
}

void TJsonWriter::Begin(const std::string& name, char begin, char end)
{
    BeginItem(name);
    fText += begin;
    fOpen.push_back({end, true});
}

void TJsonWriter::BeginItem(const std::string& name)
{
    if (fOpen.empty()) {
        return;
    }
    fText += (std::exchange(fOpen.back().fIsEmpty, false) ? "" : ",") + NewLine();
    if (!name.empty()) {
        const std::string quoted = JsonText(name, -1);
        fText.append(quoted, 0, quoted.size() - 1).append(": ");
    }
}

std::string TJsonWriter::NewLine() const
{
    return "\n" + std::string(kIndent * fOpen.size(), ' ');
}

} // namespace vrxhost
