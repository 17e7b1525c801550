// SPDX-License-Identifier: MIT
#include "host/cli/Settings.h"

#include "host/cli/Options.h"
#include "host/cli/model/ErrorReport.h"
#include "host/cli/model/Loss.h"

#include <host/TConfig.h>

#include <algorithm>
#include <fstream>

namespace vrxhost {
namespace {

using NKOLVRX20::TConfig;

struct TKey
{
    const char* fName;
    std::vector<std::string> fValues;
};

const std::vector<TKey>& Keys()
{
    static const std::vector<TKey> keys = {{"pegasus_multi_thread", {"on", "off"}}};
    return keys;
}

std::string Trimmed(const std::string& text)
{
    constexpr char kBlanks[] = " \t\r";
    const std::size_t begin = text.find_first_not_of(kBlanks);
    return begin == std::string::npos ? "" : text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

std::vector<std::string> KeyNames()
{
    std::vector<std::string> names;
    for (const TKey& key : Keys()) {
        names.emplace_back(key.fName);
    }
    return names;
}

// where: goes before the sentence.
void Check(const std::string& where, const std::string& name, const std::string& value)
{
    if (name.find('.') != std::string::npos) {
        return;
    }
    const auto key =
        std::find_if(Keys().begin(), Keys().end(), [&name](const TKey& each) { return name == each.fName; });
    if (key == Keys().end()) {
        throw TUsageError(ELossKind::kSettings, where + "there is no setting " + name + Suggestion(name, KeyNames()));
    }
    if (std::find(key->fValues.begin(), key->fValues.end(), value) == key->fValues.end()) {
        throw TUsageError(ELossKind::kSettings,
                          where + name + " is \"" + value + "\"; it can be: " + JoinNames(key->fValues));
    }
}

void CheckFile(const std::string& path)
{
    std::ifstream file(path);
    std::string line;
    for (int number = 1; std::getline(file, line); ++number) {
        constexpr char kByteOrderMark[] = "\xef\xbb\xbf";
        line = Trimmed(number == 1 && line.rfind(kByteOrderMark, 0) == 0 ? line.substr(3) : line);
        if (line.empty() || line.front() == '#') {
            continue;
        }
        const std::string where = path + ":" + std::to_string(number) + ": ";
        const std::size_t equals = line.find('=');
        if (equals == std::string::npos) {
            throw TUsageError(ELossKind::kSettings, where + "\"key = value\" is expected");
        }
        Check(where, Trimmed(line.substr(0, equals)), Trimmed(line.substr(equals + 1)));
    }
}

} // namespace

void LoadSettings(const std::string& file, const std::vector<std::pair<std::string, std::string>>& fromCommandLine)
{
    for (const auto& [name, value] : fromCommandLine) {
        Check("", name, value);
    }
    if (!file.empty()) {
        CheckFile(file);
        const std::string error = ErrorOf([&] { TConfig::GetInstance()->Load(file); });
        if (!error.empty()) {
            throw TUsageError(ELossKind::kSettings, "the settings file " + file + " could not be read: " + error);
        }
    }
    for (const auto& [name, value] : fromCommandLine) {
        TConfig::GetInstance()->setValue(name, value);
    }
}

} // namespace vrxhost
