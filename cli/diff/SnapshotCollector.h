#pragma once

#include "diff/Snapshot.h"

#include "model/Idcodes.h"
#include "query/OrderDependentNames.h"

#include <functional>
#include <map>
#include <string>
#include <unordered_map>
#include <unordered_set>
#include <vector>

class ConstraintsManager;

namespace diff {

/// Asks a manager everything, as seldom as exact answers allow: each answer is that of a manager that was asked
/// nothing before.
class Interview {
public:
    /// @param manager one that was asked nothing yet
    explicit Interview(ConstraintsManager& manager);

    /// How far the work is: so many devices of all.
    using Reached = std::function<void(std::size_t done, std::size_t total)>;

    /// To be called once.
    /// @param reached called for each device
    [[nodiscard]] Facts facts(const Reached& reached);

private:
    struct Member {
        std::string name;
        std::string family; ///< whose file has the device, or "spi" for a flash
        bool isFlash;
        bool hasTables; ///< of the family's
        DeviceFacts* facts;
    };

    using Set = std::unordered_set<std::string>;
    using Asking = std::function<Answers()>;

    // Who is asked about.
    void collect();
    void add(Member member, bool isOdd);
    [[nodiscard]] bool hasTables(const std::string& family) const;
    void findPackages();
    [[nodiscard]] DeviceFacts* device(const std::string& name);

    // In which order, and how often.
    void askApart(const Member& member);
    void askTables(const Member& member);
    void askPackages(const Member& member);
    void askRest(const Member& member);
    [[nodiscard]] std::size_t share(const std::string& group, const Asking& ask);
    [[nodiscard]] static Answers answersApart(const Asking& ask);

    // The questions.
    [[nodiscard]] Answers general();
    [[nodiscard]] Answers whatItIs(const Member& member);
    [[nodiscard]] Texts modes(const std::string& device, const char* package);
    [[nodiscard]] Answers modes(const std::string& device);
    [[nodiscard]] Answers operations(const std::string& device);
    [[nodiscard]] Answers options(const std::string& device, const char* package);
    [[nodiscard]] Answers allProperties(const Member& member);
    [[nodiscard]] Answers sectionProperties(const std::string& device);
    [[nodiscard]] Answers familyProperties(const std::string& family);
    void addFlashProperties(Answers& answers, const std::string& name, const std::string& topic);

    ConstraintsManager& m_manager;
    IdcodeFinder m_idcodes;
    why::Oddities m_oddities;
    Set m_supported;
    Set m_optionOwners;
    Set m_inMultiboot; ///< in lower case
    Facts m_facts;
    std::vector<Member> m_members;
    std::vector<Member> m_oddMembers;
    std::unordered_map<std::string, std::size_t> m_groups; ///< to their shared answers
};

} // namespace diff
