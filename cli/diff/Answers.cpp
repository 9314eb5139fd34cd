// Asks one database everything. A manager can't be made twice, so each database is asked in a process of its own.
#include "diff/Answers.h"

#include "Catalogue.h"
#include "Database.h"
#include "Idcodes.h"
#include "Json.h"
#include "Multiboot.h"
#include "Nearest.h"
#include "Progress.h"
#include "Properties.h"
#include "Status.h"
#include "Vocabulary.h"
#include "why/Apart.h"

#include <Port_MsgManData.h>
#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <functional>
#include <optional>

namespace diff {

namespace {

using TARVIKNS::MODE_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// The tables have rows for the modes up to SPI, and cells for the outputs up to STAPL.
constexpr int TABLE_MODES = static_cast<int>(MODE_TYPE::SPI) + 1;
constexpr int TABLE_OUTPUTS = static_cast<int>(OUTPUT_TYPE::STAPL) + 1;

/// Works on a database in a process of its own.
Json onDatabase(const std::vector<std::string>& directories, const std::function<Json()>& work) {
    const Json answer = Json::parse(why::apart([&] {
        std::string said;
        Port_MsgManData::setSink([&said](const Port_MsgManData::Message& message) {
            if (message.channel == Port_MsgManData::Channel::INFO) {
                said += message.text;
            }
        });
        try {
            openDatabase(directories);
            return oneLine(Json{{"answer", work()}});
        } catch (const Failure& failure) {
            return oneLine(Json{{"error", said + failure.what()}});
        } catch (const TarvikException& fault) {
            return oneLine(Json{{"error", said + "the database can't be read: " + fault.what()}});
        }
    }));
    if (answer.contains("error")) {
        throw Failure(Status::FAULT, answer.at("error").get<std::string>());
    }
    return answer.at("answer");
}

ConstraintsManager& manager() {
    ConstraintsManager* const made = ConstraintsManager::getConstraintsManager();
    if (made == nullptr) {
        throw std::bad_alloc();
    }
    made->setExceptions(false);
    return *made;
}

/// The packages that lists of the base database speak of, for a device.
Texts packagesOf(ConstraintsManager& manager, const std::string& device) {
    Texts packages;
    for (const StringBase& package : manager.getDeviceStringProperties(device.c_str(), "PACKAGES")) {
        packages.insert(plain(package));
    }
    for (const std::string& owner : catalogue::list("base", "PROGRAM_OPTION_PACKAGE")) {
        // KS5000 is no package of KS500.
        if (owner.size() > device.size() && owner.starts_with(device) &&
            (owner[device.size()] < '0' || owner[device.size()] > '9')) {
            packages.insert(owner.substr(device.size()));
        }
    }
    for (const std::string& part : catalogue::list("base", "NOT_SUPPORTED_PART_IN_MODE")) {
        const std::size_t begin = part.find('_');
        const std::size_t end = begin == part.npos ? begin : part.find('_', begin + 1);
        if (end != part.npos && part.substr(begin + 1, end - begin - 1) == device) {
            packages.insert(part.substr(end + 1));
        }
    }
    return packages;
}

Json readNames() {
    ConstraintsManager& answering = manager();
    Json devices = Json::object();
    const auto add = [&](const std::string& name) {
        devices[name] = {{"family", plain(answering.getPartFamily(name.c_str()))},
                         {"packages", packagesOf(answering, name)}};
    };
    for (const std::string& family : catalogue::families()) {
        for (const std::string& device : AcdStore::devices(family)) {
            add(device);
        }
    }
    for (const catalogue::Flash& flash : catalogue::flashes()) {
        add(flash.name);
    }
    return {{"devices", devices}};
}

/// Asks about one device.
class Interview {
public:
    Interview(ConstraintsManager& manager, const std::string& device, const IdcodeFinder& idcodes)
        : m_manager(manager), m_device(device), m_idcodes(idcodes) {}

    [[nodiscard]] Json answers(const Texts& packages) {
        askWhatItIs();
        askTables();
        askProperties();
        askMultiboot();
        for (const std::string& package : packages) {
            askModes(&package);
            askOptions(&package);
        }
        return m_answers;
    }

private:
    void add(const std::string& question, const Texts& texts) {
        if (!texts.empty()) {
            m_answers[question] = texts;
        }
    }

    void askWhatItIs() {
        add("family", {plain(m_manager.getPartFamily(m_device.c_str()))});
        if (const std::optional<IdcodeFinder::Idcode> idcode = m_idcodes.find(m_device)) {
            add("IDCODE", {idcode->value});
        }
        askModes(nullptr);
    }

    void askModes(const std::string* package) {
        Texts modes;
        for (const std::string& key : vocabulary::modes()) {
            if (m_manager.checkConstraints(vocabulary::readMode(key), m_device.c_str(),
                                           package == nullptr ? nullptr : package->c_str())) {
                modes.insert(key);
            }
        }
        add(package == nullptr ? "modes" : ofPackage(*package, "modes"), modes);
    }

    [[nodiscard]] static Texts members(int mask, const std::vector<std::string>& names) {
        Texts found;
        for (std::size_t i = 0; i < names.size(); ++i) {
            if ((static_cast<unsigned>(mask) >> i & 1U) != 0) {
                found.insert(names[i]);
            }
        }
        return found;
    }

    template <typename Ask>
    static void forEachCell(Ask ask) {
        for (int mode = 0; mode < TABLE_MODES; ++mode) {
            for (int output = 0; output < TABLE_OUTPUTS; ++output) {
                ask(static_cast<MODE_TYPE>(mode), static_cast<OUTPUT_TYPE>(output));
            }
        }
    }

    [[nodiscard]] static std::string cell(const char* what, MODE_TYPE mode, OUTPUT_TYPE output) {
        return fmt::format("{} in {} through {}", what, vocabulary::key(mode), vocabulary::key(output));
    }

    void askOptions(const std::string* package) {
        forEachCell([&](MODE_TYPE mode, OUTPUT_TYPE output) {
            const char* const text = package == nullptr ? nullptr : package->c_str();
            const std::string question = cell("options", mode, output);
            add(package == nullptr ? question : ofPackage(*package, question),
                members(m_manager.getProgramOptions(m_device.c_str(), mode, output, text),
                        vocabulary::options()));
        });
    }

    void askTables() {
        forEachCell([&](MODE_TYPE mode, OUTPUT_TYPE output) {
            add(cell("operations", mode, output),
                members(m_manager.getDeviceOperations(m_device.c_str(), mode, output),
                        vocabulary::operations()));
        });
        for (int output = 0; output < TABLE_OUTPUTS; ++output) {
            const auto through = static_cast<OUTPUT_TYPE>(output);
            add(fmt::format("boundary-scan operations through {}", vocabulary::key(through)),
                members(m_manager.getBsdlOperations(m_device.c_str(), through), vocabulary::operations()));
        }
        askOptions(nullptr);
    }

    void askProperties() {
        for (const Property& property : deviceProperties(m_manager, m_device)) {
            add("property " + property.key, {property.values.begin(), property.values.end()});
        }
        if (m_manager.isSpiDevice(m_device.c_str())) {
            for (const Property& property : flashProperties(m_manager, m_device)) {
                add("flash property " + property.key, {property.values.begin(), property.values.end()});
            }
        }
    }

    void askMultiboot() {
        Texts arrangements;
        for (const std::string& type : multiboot::TYPES) {
            for (const std::string& width : multiboot::WIDTHS) {
                for (const bool lead : {true, false}) {
                    if (m_manager.isMbBpiSpiSupport(m_device.c_str(), type.c_str(), width.c_str(), lead)) {
                        arrangements.insert(type + '_' + width + (lead ? "_LEAD" : "_CHAIN"));
                    }
                }
            }
        }
        add("multiboot", arrangements);
    }

    ConstraintsManager& m_manager;
    const std::string& m_device;
    const IdcodeFinder& m_idcodes;
    Json m_answers = Json::object();
};

Json readFacts(const Names& names) {
    ConstraintsManager& answering = manager();
    Json general = Json::object();
    for (const std::string& mode : vocabulary::modes()) {
        Texts outputs;
        for (const std::string& output : vocabulary::outputs()) {
            if (answering.checkConstraints(vocabulary::readMode(mode), vocabulary::readOutput(output))) {
                outputs.insert(output);
            }
        }
        general["outputs of mode " + mode] = outputs;
    }
    const std::vector<std::string> families = catalogue::families();
    general["families"] = Texts(families.begin(), families.end());

    const IdcodeFinder idcodes(answering);
    Progress progress("asking " + AcdStore::searchPath().front());
    Json devices = Json::object();
    for (const auto& [name, family] : names.devices) {
        devices[name] = Interview(answering, name, idcodes).answers(names.packages.at(name));
        progress.reach(devices.size(), names.devices.size());
    }
    return {{"general", general}, {"devices", devices}};
}

Answers answersFrom(const Json& object) {
    Answers answers;
    for (const auto& [question, texts] : object.items()) {
        answers[question] = texts.get<Texts>();
    }
    return answers;
}

} // namespace

std::string ofPackage(const std::string& package, const std::string& question) {
    return fmt::format("package {}: {}", package, question);
}

Names namesOf(const std::vector<std::string>& directories) {
    const Json answer = onDatabase(directories, readNames);
    Names names;
    for (const auto& [name, device] : answer.at("devices").items()) {
        names.devices[name] = device.at("family").get<std::string>();
        names.packages[name] = device.at("packages").get<Texts>();
    }
    return names;
}

Facts factsOf(const std::vector<std::string>& directories, const Names& names) {
    const Json answer = onDatabase(directories, [&names] { return readFacts(names); });
    Facts facts{answersFrom(answer.at("general")), {}};
    for (const auto& [name, answers] : answer.at("devices").items()) {
        facts.ofDevices[name] = answersFrom(answers);
    }
    return facts;
}

} // namespace diff
