// Finds the faults of a database that the tool survives and an application meets.
#include "query/ApplicationFault.h"

#include "query/DeviceList.h"
#include "query/FreshManager.h"
#include "query/ReadLog.h"
#include "query/Tool.h"

// The manager's own table of the locations that raise.
#include <Diagnostics.h>

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include <algorithm>
#include <cstddef>
#include <map>
#include <utility>

namespace {

namespace location = diagnostics::location;

/// Is it a location that raises because of a record, so that what was read last is at fault?
bool isAboutRecord(int line) {
    return line != location::SUPPORTED_DEVICE_UNKNOWN && line != location::PROGRAM_OPTION_PACKAGE_UNKNOWN;
}

std::string exceptionText(const TarvikException& fault) {
    return fmt::format("{} (location {})", fault.typeName(), fault.line());
}

std::string askAgain(ConstraintsManager& manager, const AnswerInWords& ask) {
    try {
        return ask(manager);
    } catch (const TarvikException& fault) {
        return exceptionText(fault);
    }
}

/// What some work raises, other than that a property is missing.
std::optional<ApplicationFault> findFault(const std::function<void()>& work) {
    ReadLog reads;
    try {
        reads.record(work);
    } catch (const TarvikException& fault) {
        if (fault.line() == location::PROPERTY_NOT_FOUND) {
            return std::nullopt;
        }
        ApplicationFault found{fault.typeName(), fault.line()};
        if (const ReadLog::Match record = reads.lastOrItsRecord(); record && isAboutRecord(fault.line())) {
            found.record = record.sourceText();
        }
        return found;
    }
    return std::nullopt;
}

Json asJson(const ApplicationFault& fault) {
    Json object{{"exception", fault.exception}, {"location", fault.location}};
    if (fault.record) {
        object.update(catalogue::asJson(fault.record->origin));
        object["fragment"] = fault.record->text;
    }
    return object;
}

/// The note for the user.
std::string noteOf(const ApplicationFault& fault, const std::optional<std::string>& answer) {
    return reasonOf(fault) + ": " + effectOf(fault, answer);
}

} // namespace

std::optional<ApplicationFault> findApplicationFault(const AnswerInWords& ask) {
    const MutedMessages muted;
    const ManagerFactory::Manager manager = ManagerFactory::make();
    std::optional<ApplicationFault> fault = findFault([&] { static_cast<void>(ask(*manager)); });
    if (fault) {
        fault->again = askAgain(*manager, ask);
    }
    return fault;
}

bool isStartUpFault(std::string_view message) {
    return message.find(" raised by Tarvik at ") != message.npos;
}

std::optional<catalogue::SourceText> findStartUpFault() {
    ReadLog reads;
    bool isReported = false;
    {
        const ReplacedSink sink([&isReported](const Port_MsgManData::Message& message) {
            isReported = isReported || isStartUpFault(message.text);
        });
        reads.record([] { static_cast<void>(ManagerFactory::make()); });
    }
    const ReadLog::Match record = reads.lastOrItsRecord();
    return isReported && record ? std::optional(record.sourceText()) : std::nullopt;
}

std::string inWords(bool answer) { return answer ? "yes" : "no"; }

std::string inWords(const std::vector<std::string>& answer) {
    return answer.empty() ? "nothing" : fmt::format("{}", fmt::join(answer, ", "));
}

std::string reasonOf(const ApplicationFault& fault) {
    if (fault.record) {
        return fmt::format("{}: \"{}\" is faulty", catalogue::asText(fault.record->origin),
                           fault.record->text);
    }
    return fault.location == location::SUPPORTED_DEVICE_UNKNOWN
               ? "DEVICE_SUPPORTED lists neither the device nor its family"
               : "PROGRAM_OPTION_PACKAGE lists neither the device nor its family";
}

std::string effectOf(const ApplicationFault& fault, const std::optional<std::string>& answer) {
    const std::string first =
        fmt::format("an application gets {} (location {})", fault.exception, fault.location);
    if (!answer) {
        return first + ", and afterwards answers without this record and those after it";
    }
    return first + (fault.again == *answer ? ", and the same answer when it asks again"
                                           : fmt::format(", and \"{}\" when it asks again", fault.again));
}

void noteApplicationFault(Tool& tool, const AnswerInWords& ask, const std::optional<std::string>& answer) {
    const std::optional<ApplicationFault> fault = findApplicationFault(ask);
    if (!fault) {
        return;
    }
    Json object = asJson(*fault);
    if (answer) {
        object["again"] = fault->again;
    }
    tool.note(noteOf(*fault, answer), "fault", std::move(object));
}

void askForTables(ConstraintsManager& manager, const std::string& device) {
    constexpr auto MODE = TARVIKNS::MODE_TYPE::BS;
    constexpr auto OUTPUT = TARVIKNS::OUTPUT_TYPE::USB2;
    static_cast<void>(manager.getDeviceOperations(device.c_str(), MODE, OUTPUT));
    static_cast<void>(manager.getProgramOptions(device.c_str(), MODE, OUTPUT, nullptr));
}

Json findApplicationFaults() {
    const MutedMessages muted;
    const ManagerFactory::Manager manager = ManagerFactory::make();
    Json faults = Json::array();
    std::map<std::string, std::vector<std::string>> devices; // by the note about the fault that they meet
    for (const ListedName& name : deviceList()) {
        const std::optional<ApplicationFault> fault = findFault(
            [&] { askForTables(name.isOrderDependent ? *ManagerFactory::make() : *manager, name.name); });
        if (!fault) {
            continue;
        }
        Json object = asJson(*fault);
        const std::string note = object["note"] = noteOf(*fault, std::nullopt);
        devices[note].push_back(name.name);
        if (devices[note].size() == 1) {
            faults.push_back(std::move(object));
        }
    }
    for (Json& fault : faults) {
        if (!fault.contains("file")) {
            const std::vector<std::string>& concerned = devices[fault["note"]];
            const std::size_t others = concerned.size() - 1;
            fault["note"] = fmt::format("{}{}: {}", concerned.front(),
                                        others == 0 ? "" : fmt::format(" and {} more", others),
                                        fault["note"].get<std::string>());
        }
    }
    return faults;
}

void noteApplicationFaults(Tool& tool, const Json& faults) {
    constexpr std::size_t SHOWN = 5;
    for (std::size_t position = 0; position < std::min(SHOWN, faults.size()); ++position) {
        tool.note(faults[position]["note"]);
    }
    if (faults.size() > SHOWN) {
        tool.note(fmt::format("{} more such faults: see tarvik lint", faults.size() - SHOWN));
    }
    if (!faults.empty()) {
        tool.addMember("applicationFaults", faults);
    }
}
