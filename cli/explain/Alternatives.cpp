// What comes nearest to a no: where else the same is allowed, and which relatives of the device differ.
#include "explain/Explanation.h"

#include "explain/Chain.h"

#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <AcdStore.h>

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace why {

namespace {

using Kind = Question::Kind;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// The extents of the permission tables, where a longer search finds nothing.
constexpr int TABLE_MODES = 6;
constexpr int TABLE_OUTPUTS = 5;
constexpr int ALL_OUTPUTS = 10;

constexpr std::size_t MOST_NAMES = 8;

/// The names, the first of them when there are many.
std::string some(const std::vector<std::string>& names) {
    const std::size_t shown = std::min(names.size(), MOST_NAMES);
    const std::vector<std::string> first(names.begin(), names.begin() + static_cast<std::ptrdiff_t>(shown));
    return listed(first) + (shown < names.size() ? fmt::format(" and {} more", names.size() - shown) : "");
}

class Search {
public:
    Search(const StartUp& facts, Question question) : m_facts(facts), m_question(std::move(question)) {}

    [[nodiscard]] std::vector<Step> run() {
        switch (m_question.kind) {
        case Kind::OUTPUT:
        case Kind::DEVICE:
        case Kind::OPERATION_IN_MODE:
            modes();
            break;
        case Kind::DEVICE_THROUGH:
            modesAndOutputs(static_cast<int>(StartUp::MODES), ALL_OUTPUTS);
            break;
        case Kind::OPERATION:
        case Kind::OPTION:
            modesAndOutputs(TABLE_MODES, TABLE_OUTPUTS);
            break;
        case Kind::BSDL:
            outputs("", TABLE_OUTPUTS);
            break;
        case Kind::PROPERTY:
            properties();
            break;
        }
        if (m_steps.empty() && (m_question.kind == Kind::OPERATION || m_question.kind == Kind::BSDL)) {
            otherOperations();
        }
        relatives();
        return std::move(m_steps);
    }

private:
    [[nodiscard]] bool isYes() const { return explain(m_facts, m_question).verdict == Verdict::YES; }

    /// In SPI mode the tables of all flashes answer for every device.
    [[nodiscard]] bool isAnsweredForAll() const {
        return m_question.mode == MODE_TYPE::SPI &&
               (m_question.kind == Kind::OPERATION || m_question.kind == Kind::OPTION);
    }

    void add(const char* topic, std::string text, std::optional<Piece> place = {}) {
        m_steps.push_back({topic, std::move(text), std::move(place)});
    }

    /// Calls `use` with the question changed in one member, which is put back afterwards.
    template <typename Member, typename Use>
    void with(Member Question::*member, Member value, Use use) {
        Member former = std::exchange(m_question.*member, std::move(value));
        use();
        m_question.*member = std::move(former);
    }

    void modes() {
        std::vector<std::string> found;
        for (int mode = 0; mode < static_cast<int>(StartUp::MODES); ++mode) {
            with(&Question::mode, static_cast<MODE_TYPE>(mode), [&] {
                if (isYes()) {
                    found.push_back(vocabulary::key(m_question.mode));
                }
            });
        }
        if (!found.empty()) {
            add("instead", "yes in mode " + listed(found));
        }
    }

    void modesAndOutputs(int modeCount, int outputCount) {
        for (int mode = 0; mode < modeCount; ++mode) {
            with(&Question::mode, static_cast<MODE_TYPE>(mode),
                 [&] { outputs(" in mode " + vocabulary::key(m_question.mode), outputCount); });
        }
    }

    /// One step for each record that allows the same through other outputs.
    void outputs(const std::string& where, int outputCount) {
        std::vector<std::string> found;
        std::optional<Piece> record;
        const char* const whoever = isAnsweredForAll() ? ", whatever the device" : "";
        const auto flush = [&] {
            if (!found.empty()) {
                add("instead", fmt::format("yes{} through {}{}", where, listed(found), whoever), record);
            }
            found.clear();
        };
        for (int output = 0; output < outputCount; ++output) {
            with(&Question::output, static_cast<OUTPUT_TYPE>(output), [&] {
                const Explanation explanation = explain(m_facts, m_question);
                if (explanation.verdict != Verdict::YES) {
                    return;
                }
                // The mode tables name each output by itself: their places would fill the screen.
                const Piece* const place =
                    m_question.kind == Kind::DEVICE_THROUGH ? nullptr : explanation.decidingRecord();
                if (place != nullptr && record && !isSamePlace(*place, *record)) {
                    flush();
                }
                record = place == nullptr ? std::nullopt : std::optional(*place);
                found.push_back(vocabulary::key(m_question.output));
            });
        }
        flush();
    }

    static bool isSamePlace(const Piece& left, const Piece& right) {
        return left.origin.file == right.origin.file && left.origin.line == right.origin.line &&
               left.origin.column == right.origin.column;
    }

    void otherOperations() {
        std::vector<std::string> found;
        for (std::size_t operation = 0; operation < vocabulary::operations().size(); ++operation) {
            with(&Question::operation, static_cast<OP_TYPE>(operation), [&] {
                if (isYes()) {
                    found.push_back(vocabulary::key(m_question.operation));
                }
            });
        }
        if (!found.empty()) {
            add("instead", "allowed there: " + listed(found));
        }
    }

    /// The property that was meant, should the key be mistyped.
    void properties() {
        std::vector<std::string> keys;
        const auto addKeys = [&](const std::string& database, const char* key) {
            for (const Record& record : readRecords(database, key).all) {
                keys.push_back(record.fields.front().text);
            }
        };
        if (m_facts.isFlash(m_question.device)) {
            addKeys("spi.acd", (upperCase(m_question.device) + "_PROPERTY").c_str());
        } else {
            for (const std::string& owner : {m_question.device, family()}) {
                addKeys(owner, "PROPERTY");
                addKeys(owner, "PROPERTIES");
            }
        }
        if (std::find(keys.begin(), keys.end(), m_question.property) != keys.end()) {
            return;
        }
        if (const std::optional<std::string> meant = nearest(m_question.property, keys)) {
            add("instead", fmt::format("there is a property {}", *meant));
        }
    }

    [[nodiscard]] std::string family() const {
        Replay replay(m_facts);
        return replay.resolve(m_question.device).family;
    }

    /// The names in the same family that may answer otherwise: those that have tables of their own, or all devices
    /// where properties decide.
    [[nodiscard]] std::vector<std::string> relativesOf(const std::string& family) const {
        if (m_question.kind == Kind::OPERATION_IN_MODE || m_question.kind == Kind::PROPERTY) {
            return AcdStore::devices(family);
        }
        std::vector<std::string> found;
        for (const auto& [name, listing] :
             m_question.kind == Kind::OPTION ? m_facts.packages : m_facts.supported) {
            Replay replay(m_facts);
            if (replay.resolve(name).family == family) {
                found.push_back(name);
            }
        }
        return found;
    }

    void relatives() {
        if (m_question.kind == Kind::OUTPUT || m_question.kind == Kind::DEVICE ||
            m_question.kind == Kind::DEVICE_THROUGH) {
            return;
        }
        packages();
        const std::string own = family();
        if (isAnsweredForAll() || own == "base" || own == "spi") {
            return;
        }
        std::vector<std::string> found;
        for (const std::string& name : relativesOf(own)) {
            with(&Question::device, name, [&] {
                if (isYes()) {
                    found.push_back(name == own ? "the family itself" : name);
                }
            });
        }
        if (!found.empty()) {
            add("differs", fmt::format("in family {}, yes for {}", own, some(found)));
        }
    }

    /// The packages in which the device has options of its own.
    void packages() {
        if (m_question.kind != Kind::OPTION) {
            return;
        }
        std::vector<std::string> found;
        for (const auto& [name, listing] : m_facts.packages) {
            if (name.size() > m_question.device.size() && name.starts_with(m_question.device)) {
                with(&Question::package, std::optional(name.substr(m_question.device.size())), [&] {
                    if (isYes()) {
                        found.push_back(*m_question.package);
                    }
                });
            }
        }
        if (!found.empty()) {
            add("differs", "yes in package " + some(found));
        }
    }

    const StartUp& m_facts;
    Question m_question;
    std::vector<Step> m_steps;
};

} // namespace

std::vector<Step> alternatives(const StartUp& facts, const Question& question) {
    return Search(facts, question).run();
}

} // namespace why
