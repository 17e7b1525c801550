// SPDX-License-Identifier: MIT
#include "providers/linux/Classes.h"
#include "providers/linux/Parse.h"

#include <array>

namespace lnx {
namespace {

constexpr char kSensorFolder[] = "/sys/class/hwmon/";
constexpr std::string_view kInput = "_input";
constexpr std::int64_t kThousandths = 1000; // the kernel's unit is a thousandth of a degree
constexpr std::int64_t kLowest = -273;      // degrees; chips report nonsense for limits that they lack
constexpr std::int64_t kHighest = 1000;
constexpr std::uint16_t kTemperature = 2;
constexpr std::uint16_t kDegreesC = 2;

struct Limit
{
    const char* property;
    const char* suffix; // of the kernel's file
};

constexpr std::array kLimits{Limit{"LowerThresholdCritical", "_lcrit"}, Limit{"LowerThresholdNonCritical", "_min"},
                             Limit{"UpperThresholdNonCritical", "_max"}, Limit{"UpperThresholdCritical", "_crit"},
                             Limit{"UpperThresholdFatal", "_emergency"}};

// Returns: the temperature in whole degrees.
std::optional<std::int32_t> degrees(const SystemTree& tree, const std::string& path)
{
    const auto thousandths = tree.integer(path);
    if (!thousandths || *thousandths < kLowest * kThousandths || *thousandths > kHighest * kThousandths) {
        return std::nullopt;
    }
    const std::int64_t half = *thousandths < 0 ? -kThousandths / 2 : kThousandths / 2;
    return static_cast<std::int32_t>((*thousandths + half) / kThousandths);
}

std::string stateOf(const SystemTree& tree, const std::string& path, const Record& record)
{
    const auto value = [&record](const char* name) {
        const Value* const found = record.find(name);
        return found ? std::optional<std::int32_t>(std::get<std::int32_t>(*found)) : std::nullopt;
    };
    const auto reading = value("CurrentReading");
    const auto isAbove = [&](const char* name) { return value(name) && *reading >= *value(name); };
    if (tree.flag(path + "_fault").value_or(false)) {
        return "Fault";
    }
    if (!reading) {
        return "Unknown";
    }
    if (tree.flag(path + "_crit_alarm").value_or(false) || isAbove("UpperThresholdCritical")) {
        return "Critical";
    }
    return isAbove("UpperThresholdNonCritical") ? "High" : "Normal";
}

Record temperature(const SystemTree& tree, const std::string& chip, const std::string& channel)
{
    const std::string folder = kSensorFolder + chip + "/";
    const std::string path = folder + channel;
    const std::string name = tree.word(folder + "name").value_or(chip);
    // Each boot numbers the chips again; the devices that they belong to keep their names.
    const std::string owner = tree.linkedName(folder + "device").value_or(chip);
    Record record = device(tree, "LNX_TemperatureSensor", owner + "/" + channel);
    record.set("Name", name + " " + tree.word(path + "_label").value_or(channel));
    record.set("ElementName", name + " " + tree.word(path + "_label").value_or(channel));
    record.set("EnabledState", std::uint16_t{2}); // Enabled
    record.set("SensorType", kTemperature);
    record.set("BaseUnits", kDegreesC);
    record.set("UnitModifier", std::int32_t{0});
    record.set("CurrentReading", degrees(tree, path + std::string(kInput)));
    for (const Limit& limit : kLimits) {
        record.set(limit.property, degrees(tree, path + limit.suffix));
    }
    record.set("PossibleStates", std::vector<std::string>{"Unknown", "Fault", "Normal", "High", "Critical"});
    record.set("CurrentState", stateOf(tree, path, record));
    return record;
}

} // namespace

std::vector<Record> temperatureSensors(const SystemTree& tree)
{
    std::vector<Record> result;
    for (const std::string& chip : tree.entries("/sys/class/hwmon")) {
        for (const std::string& file : tree.entries(kSensorFolder + chip)) {
            const std::size_t end = file.rfind(kInput);
            if (file.rfind("temp", 0) == 0 && end != std::string::npos && end + kInput.size() == file.size()) {
                result.push_back(temperature(tree, chip, file.substr(0, end)));
            }
        }
    }
    return result;
}

} // namespace lnx
