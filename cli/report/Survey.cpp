// Asks about all devices, in one process as far as the answers stay those of a manager that was asked nothing.
#include "report/Survey.h"

#include "query/Apart.h"
#include "query/DeviceList.h"
#include "query/OrderDependentNames.h"
#include "query/Tool.h"
#include "term/Progress.h"

#include <TarvikException.h>
#include <tarvik/ConstraintsManager.h>

#include <fmt/format.h>

#include <map>
#include <unordered_set>
#include <utility>
#include <vector>

// How a sheet comes back from the process that made it: as MessagePack, which takes any byte.
namespace catalogue {
NLOHMANN_DEFINE_TYPE_NON_INTRUSIVE(Origin, file, line, column, layer)
NLOHMANN_DEFINE_TYPE_NON_INTRUSIVE(Shadow, text, origin)
} // namespace catalogue
NLOHMANN_DEFINE_TYPE_NON_INTRUSIVE(Property, key, values, from, origin, shadows)

namespace report {

namespace {

using Packed = nlohmann::json;

Packed packed(const std::vector<DeviceSheet::Row>& rows) {
    Packed list = Packed::array();
    for (const DeviceSheet::Row& row : rows) {
        list.push_back(Packed::array({row.key, row.outputs, row.bsdl}));
    }
    return list;
}

std::vector<DeviceSheet::Row> unpackedRows(const Packed& list) {
    std::vector<DeviceSheet::Row> rows;
    for (const Packed& row : list) {
        DeviceSheet::Row one{};
        row.at(0).get_to(one.key);
        row.at(1).get_to(one.outputs);
        row.at(2).get_to(one.bsdl);
        rows.push_back(std::move(one));
    }
    return rows;
}

Packed packed(const DeviceSheet& sheet) {
    Packed object{{"family", sheet.family},
                  {"modes", sheet.modes},
                  {"properties", sheet.properties},
                  {"flash", sheet.flash},
                  {"flashProperties", sheet.flashProperties},
                  {"operations", packed(sheet.operations)},
                  {"options", packed(sheet.options)}};
    if (sheet.idcode) {
        object["idcode"] = {{"value", sheet.idcode->value},
                            {"origin", sheet.idcode->origin},
                            {"shadows", sheet.idcode->shadows}};
    }
    object["multiboot"] = Packed::array();
    for (const DeviceSheet::Arrangement& one : sheet.multiboot) {
        object["multiboot"].push_back(Packed::array({one.type, one.width, one.position}));
    }
    return object;
}

/// Fills in what `packed` holds.
void unpack(const Packed& object, DeviceSheet& sheet) {
    object.at("family").get_to(sheet.family);
    object.at("modes").get_to(sheet.modes);
    object.at("properties").get_to(sheet.properties);
    object.at("flash").get_to(sheet.flash);
    object.at("flashProperties").get_to(sheet.flashProperties);
    sheet.operations = unpackedRows(object.at("operations"));
    sheet.options = unpackedRows(object.at("options"));
    if (object.contains("idcode")) {
        const Packed& idcode = object.at("idcode");
        sheet.idcode = {idcode.at("value").get<std::string>(), idcode.at("origin").get<catalogue::Origin>(),
                        idcode.at("shadows").get<catalogue::Shadows>()};
    }
    for (const Packed& one : object.at("multiboot")) {
        sheet.multiboot.push_back(
            {one.at(0).get<std::string>(), one.at(1).get<std::string>(), one.at(2).get<std::string>()});
    }
}

DeviceSheet namedSheet(const why::Member& member) {
    DeviceSheet sheet{};
    sheet.name = member.name;
    sheet.spelling = member.name;
    sheet.family = member.family;
    return sheet;
}

/// Asks in a process of its own, faults included.
Subject askApart(Tool& tool, const why::Member& member) {
    const Packed answer = Packed::from_msgpack(why::apart([&] {
        Packed object;
        try {
            object = packed(deviceSheet(tool, member.name));
        } catch (const CommandError& failure) {
            object["fault"] = failure.what();
        } catch (const TarvikException& fault) {
            object["fault"] = fmt::format("the database can't be read: {}", fault.typeName());
        }
        std::string text;
        Packed::to_msgpack(object, text);
        return text;
    }));
    Subject subject{namedSheet(member), ""};
    if (answer.contains("fault")) {
        answer.at("fault").get_to(subject.fault);
    } else {
        unpack(answer, subject.sheet);
    }
    return subject;
}

class Survey {
public:
    explicit Survey(Tool& tool)
        : m_tool(tool), m_members(why::members()),
          m_supported(set(catalogue::list("base.acd", "DEVICE_SUPPORTED"))),
          m_packages(set(catalogue::list("base.acd", "PROGRAM_OPTION_PACKAGE"))) {}

    void run(const std::function<void(const Subject&)>& use) {
        askOddOnes();
        askTables();
        FactReader facts(m_tool.manager());
        Progress progress("asking for each device");
        for (std::size_t position = 0; position < m_members.size(); ++position) {
            progress.reach(position, m_members.size());
            if (const auto known = m_apart.find(position); known != m_apart.end()) {
                use(known->second);
                continue;
            }
            Subject subject{m_tables.at(group(m_members[position])), ""};
            subject.sheet.name = m_members[position].name;
            subject.sheet.spelling = subject.sheet.name;
            facts.addFacts(subject.sheet);
            use(subject);
        }
    }

private:
    using Set = std::unordered_set<std::string>;

    /// The owners of the operations and of the options that answer for a device.
    using Group = std::pair<std::string, std::string>;

    static Set set(const std::vector<std::string>& names) { return {names.begin(), names.end()}; }

    [[nodiscard]] Group group(const why::Member& member) const {
        return {m_supported.count(member.name) != 0 ? member.name : member.family,
                m_packages.count(member.name) != 0 ? member.name : member.family};
    }

    /// First, as long as the manager was asked nothing.
    void askOddOnes() {
        for (std::size_t position = 0; position < m_members.size(); ++position) {
            const why::Member& member = m_members[position];
            if (member.isEntangled || member.isFaulty || why::hasUnknownOption(member.name, true)) {
                m_apart.emplace(position, askApart(m_tool, member));
            } else if (m_supported.count(member.family) == 0) {
                // A family without a table may leave its records in another one's.
                askTables(member, Asking::APART);
            }
        }
    }

    /// Before the properties, which bring a device's own options into memory, but not always those of its family.
    void askTables() {
        for (std::size_t position = 0; position < m_members.size(); ++position) {
            if (m_apart.count(position) == 0) {
                askTables(m_members[position], Asking::HERE);
            }
        }
    }

    /// Once for each group.
    void askTables(const why::Member& member, Asking asking) {
        const auto [known, isNew] = m_tables.try_emplace(group(member));
        if (isNew) {
            known->second.name = member.name;
            addTables(known->second, m_tool, asking);
        }
    }

    Tool& m_tool;
    std::vector<why::Member> m_members;
    Set m_supported;
    Set m_packages;
    std::map<std::size_t, Subject> m_apart; ///< by position among the members
    std::map<Group, DeviceSheet> m_tables;  ///< with tables alone
};

} // namespace

void survey(Tool& tool, const std::function<void(const Subject&)>& use) {
    static_cast<void>(tool.manager());
    Survey(tool).run(use);
}

} // namespace report
