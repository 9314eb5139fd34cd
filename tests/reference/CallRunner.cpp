// Puts the same calls to the manager and to the reference, and compares what comes of them.
#include "CallRunner.h"

#include "HeldResults.h"
#include "Reference.h"
#include "support/TarvikTestPeer.h"

#include <TarvikException.h>
#include <TarvikSmokeMgr.h>
#include <tarvik/ConstraintsManager.h>

#include <gtest/gtest.h>

#include <sstream>
#include <utility>

namespace reference {

namespace {

// What differs in how the two take and give texts.

template <typename Target>
struct Terms;

template <>
struct Terms<ConstraintsManager> {
    using Recorder = TarvikSmokeMgr;
    using Held = HeldResults;
    static StringBase text(const std::string& text) { return {text.data(), text.size()}; }
    static std::string recorded(const TarvikSmokeMgr& recorder) { return show(recorder.text()); }
    static bool isTheOne(const ConstraintsManager& manager) {
        return ConstraintsManager::getConstraintsManager() == &manager;
    }
};

template <>
struct Terms<Reference> {
    using Recorder = std::string;
    using Held = NothingHeld;
    static std::string text(const std::string& text) { return text; }
    static std::string recorded(const std::string& recorder) { return show(recorder); }
    static bool isTheOne(const Reference&) { return true; }
};

/// The arguments of a call, as what the methods take.
class Arguments {
public:
    /// @param held takes the place of an argument where it is not null
    Arguments(const Call& call, const std::vector<const char*>& held)
        : m_arguments(call.arguments), m_held(held) {}

    [[nodiscard]] const char* text(std::size_t number) const {
        if (number < m_held.size() && m_held[number] != nullptr) {
            return m_held[number];
        }
        const auto* text = std::get_if<std::string>(&m_arguments.at(number));
        return text == nullptr ? nullptr : text->c_str();
    }
    [[nodiscard]] std::string bytes(std::size_t number) const {
        const auto* text = std::get_if<std::string>(&m_arguments.at(number));
        return text == nullptr ? "" : *text;
    }
    [[nodiscard]] bool flag(std::size_t number) const { return std::get<bool>(m_arguments.at(number)); }
    template <typename Enumeration>
    [[nodiscard]] Enumeration value(std::size_t number) const {
        return static_cast<Enumeration>(std::get<int>(m_arguments.at(number)));
    }
    [[nodiscard]] auto mode(std::size_t number) const { return value<TARVIKNS::MODE_TYPE>(number); }
    [[nodiscard]] auto output(std::size_t number) const { return value<TARVIKNS::OUTPUT_TYPE>(number); }
    [[nodiscard]] auto operation(std::size_t number) const { return value<TARVIKNS::OP_TYPE>(number); }
    [[nodiscard]] auto option(std::size_t number) const { return value<TARVIKNS::PROGRAM_OPTION>(number); }

private:
    const std::vector<Argument>& m_arguments;
    const std::vector<const char*>& m_held;
};

/// What a dump writes into a recorder; with none, its messages tell.
template <typename Target, typename Dump>
std::string dumped(bool recorded, Dump dump) {
    typename Terms<Target>::Recorder recorder;
    dump(recorded ? &recorder : nullptr);
    return Terms<Target>::recorded(recorder);
}

template <typename Target>
std::string invoke(Target& target, const Call& call, const std::vector<const char*>& heldArguments,
                   typename Terms<Target>::Held& held) {
    const Arguments a(call, heldArguments);
    switch (call.method) {
        using enum Method;
    case GET_CONSTRAINTS_MANAGER:
        return show(Terms<Target>::isTheOne(target));
    case SET_EXCEPTIONS:
        target.setExceptions(a.flag(0));
        return "";
    case GET_OPERATION_ORDERS:
        return show(held.hold(target.getOperationOrders()));
    case GET_PROGRAM_OPTION_ORDERS:
        return show(held.hold(target.getProgramOptionOrders()));
    case MODE_STRING_2_TYPE:
        return show(target.modeString2Type(a.text(0)));
    case MODE_TYPE_2_STRING:
        return show(target.modeType2String(a.mode(0)));
    case CABLE_STRING_2_TYPE:
        return show(target.cableString2Type(a.text(0)));
    case CABLE_TYPE_2_STRING:
        return show(target.cableType2String(a.output(0)));
    case OPERATION_STRING_2_TYPE:
        return show(target.operationString2Type(a.text(0)));
    case OPERATION_TYPE_2_STRING:
        return show(target.operationType2String(a.operation(0)));
    case OPERATION_DISPLAY_STRING_2_TYPE:
        return show(target.operationDisplayString2Type(a.text(0)));
    case OPERATION_TYPE_2_DISPLAY_STRING:
        return show(target.operationType2DisplayString(a.operation(0)));
    case OPTION_STRING_2_TYPE:
        return show(target.optionString2Type(a.text(0)));
    case OPTION_TYPE_2_STRING:
        return show(target.optionType2String(a.option(0)));
    case REMOVE_PACKAGE_NAME: {
        auto device = Terms<Target>::text(a.bytes(0));
        target.removePackageName(device);
        return show(device);
    }
    case CHECK_OUTPUT:
        return show(target.checkConstraints(a.mode(0), a.output(1)));
    case CHECK_DEVICE:
        return show(target.checkConstraints(a.mode(0), a.text(1), a.text(2)));
    case CHECK_OUTPUT_AND_DEVICE:
        return show(target.checkConstraints(a.mode(0), a.output(1), a.text(2), a.text(3)));
    case CHECK_OPERATION:
        return show(target.checkConstraints(a.mode(0), a.output(1), a.text(2), a.operation(3), a.text(4)));
    case CHECK_OPERATION_PROPERTY:
        return show(target.checkConstraints(a.text(0), a.mode(1), a.operation(2), a.text(3)));
    case GET_DEVICE_OPERATIONS:
        return show(target.getDeviceOperations(a.text(0), a.mode(1), a.output(2)));
    case GET_PROGRAM_OPTIONS:
        return show(target.getProgramOptions(a.text(0), a.mode(1), a.output(2), a.text(3)));
    case GET_BSDL_OPERATIONS:
        return show(target.getBsdlOperations(a.text(0), a.output(1)));
    case GET_DEVICE_OPERATION_OPTIONS:
        return show(held.hold(target.getDeviceOperationOptions(a.text(0), a.text(1), a.mode(2))));
    case GET_DEVICE_STRING_PROPERTIES:
        return show(held.hold(target.getDeviceStringProperties(a.text(0), a.text(1))));
    case GET_DEVICE_STRING_PROPERTY:
        return show(held.hold(target.getDeviceStringProperty(a.text(0), a.text(1))));
    case GET_DEVICE_BOOL_PROPERTY:
        return show(target.getDeviceBoolProperty(a.text(0), a.text(1)));
    case GET_DEVICE_LONG_PROPERTY:
        return show(target.getDeviceLongProperty(a.text(0), a.text(1)));
    case GET_PART_FAMILY:
        return show(target.getPartFamily(a.text(0)));
    case ADD_CACHED_DEVICE_FAMILY:
        target.addCachedDeviceFamily(a.text(0), a.text(1));
        return "";
    case IS_KORVEL_DEVICE:
        return show(target.isKorvelDevice(a.text(0)));
    case GET_ALL_DEVICE_IDCODES:
        return show(held.hold(target.getAllDeviceIdcodes()));
    case IS_SPI_DEVICE:
        return show(target.isSpiDevice(Terms<Target>::text(a.bytes(0))));
    case GET_SPI_DEVICE_STRING_PROPERTY:
        return show(held.hold(target.getSpiDeviceStringProperty(a.text(0), a.text(1))));
    case GET_SPI_DEVICE_BOOL_PROPERTY:
        return show(target.getSpiDeviceBoolProperty(a.text(0), a.text(1)));
    case GET_SPI_DEVICE_LONG_PROPERTY:
        return show(target.getSpiDeviceLongProperty(a.text(0), a.text(1)));
    case IS_MB_BPI_SPI_SUPPORT:
        return show(target.isMbBpiSpiSupport(a.text(0), a.text(1), a.text(2), a.flag(3)));
    case DUMP_OPERATIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpOperationsTable(recorder); });
    case DUMP_BSDL_OPERATIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpBsdlOperationsTable(recorder); });
    case DUMP_PROGRAM_OPTIONS_TABLE:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpProgramOptionsTable(recorder); });
    case DUMP_CACHED_DEVICE_FAMILIES:
        return dumped<Target>(a.flag(0), [&](auto* recorder) { target.dumpCachedDeviceFamilies(recorder); });
    case DUMP_MB_BPI_SPI:
        target.dumpMbBpiSpi();
        return "";
    }
    return "no such method";
}

Outcome outcomeOf(ConstraintsManager& manager, ManagerMessages& messages, const Call& call,
                  const std::vector<const char*>& heldArguments, HeldResults& held) {
    Outcome outcome;
    try {
        outcome.result = invoke(manager, call, heldArguments, held);
    } catch (const TarvikException& exception) {
        outcome.result = showRaised(exception);
    }
    outcome.messages = messages.take();
    return outcome;
}

/// Both, alive over the same databases.
class Pair {
public:
    explicit Pair(const Files& files) : m_reference(files) {
        TarvikTestPeer::reset();
        AcdStore::setMemoryFiles(files);
        m_messages.listen();
        m_manager = ConstraintsManager::getConstraintsManager();
    }
    ~Pair() { TarvikTestPeer::reset(); }
    Pair(const Pair&) = delete;
    Pair& operator=(const Pair&) = delete;

    [[nodiscard]] std::string startUpDifference() {
        std::vector<Message> expected = m_reference.takeMessages();
        if (isBaseMissing()) {
            expected.clear(); // The database layer reports that, which is looked at in the end.
        }
        return compare("the start-up", {"", expected}, {"", m_messages.take()});
    }

    [[nodiscard]] std::string callDifference(const Call& call) {
        std::ostringstream name;
        name << call;
        Call plain = call;
        std::vector<const char*> held(call.arguments.size(), nullptr);
        for (std::size_t number = 0; number < held.size(); ++number) {
            if (const auto* wanted = std::get_if<HeldText>(&call.arguments[number])) {
                held[number] = m_held.text(wanted->number);
                plain.arguments[number] = std::string(held[number]);
            }
        }
        return compare(name.str(), ask(m_reference, plain), askHolding(plain, held));
    }

    /// All that the manager returned is still what it was.
    [[nodiscard]] std::string heldDifference() const { return m_held.difference(); }

    [[nodiscard]] std::string memberDifference() {
        const std::vector<Member> expected = members(m_reference);
        const std::vector<Member> actual = members(*m_manager);
        std::string differences;
        for (std::size_t number = 0; number < expected.size(); ++number) {
            differences += compare("member " + expected[number].name, {expected[number].value, {}},
                                   {actual[number].value, {}});
        }
        return differences;
    }

    /// The database layer speaks up about malformed lines, at most once each, and about nothing else.
    [[nodiscard]] std::string databaseMessageDifference() const {
        const std::size_t missingBase = isBaseMissing() ? 2 : 0;
        const std::size_t limit = m_reference.databases().faults() + missingBase;
        if (m_messages.ofDatabase() > limit || m_messages.ofDatabase() < missingBase) {
            return "the database layer issued " + std::to_string(m_messages.ofDatabase()) +
                   " messages, expected " + std::to_string(missingBase) + " to " + std::to_string(limit) +
                   "\n";
        }
        return "";
    }

private:
    [[nodiscard]] Outcome askHolding(const Call& call, const std::vector<const char*>& heldArguments) {
        return outcomeOf(*m_manager, m_messages, call, heldArguments, m_held);
    }

    [[nodiscard]] bool isBaseMissing() const { return !m_reference.databases().has("base.acd"); }

    Reference m_reference;
    ManagerMessages m_messages;
    HeldResults m_held;
    ConstraintsManager* m_manager = nullptr;
};

} // namespace

Outcome ask(ConstraintsManager& manager, ManagerMessages& messages, const Call& call) {
    HeldResults held;
    return outcomeOf(manager, messages, call, {}, held);
}

Outcome ask(Reference& reference, const Call& call) {
    Outcome outcome;
    try {
        NothingHeld held;
        outcome.result = invoke(reference, call, {}, held);
    } catch (const Raised& raised) {
        outcome.result = showRaised(raised.type, raised.line);
    }
    outcome.messages = reference.takeMessages();
    return outcome;
}

std::string difference(const Scenario& scenario, Ending ending) {
    Pair pair(scenario.files);
    std::string found = pair.startUpDifference();
    for (auto call = scenario.calls.begin(); found.empty() && call != scenario.calls.end(); ++call) {
        found = pair.callDifference(*call);
    }
    for (const Method dump : {Method::DUMP_OPERATIONS_TABLE, Method::DUMP_BSDL_OPERATIONS_TABLE,
                              Method::DUMP_PROGRAM_OPTIONS_TABLE, Method::DUMP_CACHED_DEVICE_FAMILIES}) {
        if (found.empty() && ending == Ending::DUMPS_AND_MEMBERS) {
            found = pair.callDifference({dump, {true}});
        }
    }
    if (found.empty()) {
        found = pair.heldDifference() + pair.memberDifference() + pair.databaseMessageDifference();
    }
    return found;
}

void expectAgreement(const Scenario& scenario) { EXPECT_EQ(difference(scenario), ""); }

} // namespace reference
