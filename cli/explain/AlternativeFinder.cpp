// What comes nearest to a no: where else the same is allowed, and which relatives of the device differ.
#include "explain/Explanation.h"

#include "explain/ExplanationBuilder.h"

#include "model/Catalogue.h"
#include "model/Multiboot.h"
#include "model/Schema.h"
#include "model/Vocabulary.h"
#include "text/Suggest.h"

#include <AcdStore.h>

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace explanation {

namespace {

using Kind = Question::Kind;
using TARVIKNS::MODE_TYPE;
using TARVIKNS::OP_TYPE;
using TARVIKNS::OUTPUT_TYPE;

/// The extents of the permission tables, where a longer search finds nothing.
constexpr int TABLE_MODES = 6;
constexpr int TABLE_OUTPUTS = 5;
constexpr int ALL_OUTPUTS = 10;

constexpr std::size_t MAX_NAMES = 8;

/// The names, the first of them when there are many.
std::string some(const std::vector<std::string>& names) {
    const std::size_t shown = std::min(names.size(), MAX_NAMES);
    const std::vector<std::string> first(names.begin(), names.begin() + static_cast<std::ptrdiff_t>(shown));
    return listed(first) + (shown < names.size() ? fmt::format(" and {} more", names.size() - shown) : "");
}

class AlternativeFinder {
public:
    explicit AlternativeFinder(Question question) : m_question(std::move(question)) {}

    [[nodiscard]] std::vector<Step> run() {
        switch (m_question.kind) {
        case Kind::OUTPUT:
        case Kind::DEVICE:
        case Kind::OPERATION_IN_MODE:
        case Kind::OPERATION_OPTIONS:
        case Kind::DEVICE_IN_MODE:
            modes();
            break;
        case Kind::DEVICE_THROUGH:
            modesAndOutputs(static_cast<int>(vocabulary::modes().size()), ALL_OUTPUTS);
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
        case Kind::MULTIBOOT:
            arrangements();
            break;
        case Kind::COMPLETE:
        case Kind::COMPLETE_IN_MODE:
            // Each part has its own alternatives.
            return {};
        }
        if (m_steps.empty() && (m_question.kind == Kind::OPERATION || m_question.kind == Kind::BSDL)) {
            otherOperations();
        }
        siblingDevices();
        return std::move(m_steps);
    }

private:
    [[nodiscard]] bool isYes() const { return askFreshManager(m_question) == Conclusion::YES; }

    /// In SPI mode the tables of all flashes answer for every device.
    [[nodiscard]] bool isAnsweredForAll() const {
        return m_question.mode == MODE_TYPE::SPI &&
               (m_question.kind == Kind::OPERATION || m_question.kind == Kind::OPTION);
    }

    void add(const char* topic, std::string text, std::optional<SourceText> place = {}) {
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
        for (int mode = 0; mode < static_cast<int>(vocabulary::modes().size()); ++mode) {
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
        std::optional<SourceText> record;
        const char* const scope = isAnsweredForAll() ? ", for every device" : "";
        const auto flush = [&] {
            if (!found.empty()) {
                add("instead", fmt::format("yes{} through {}{}", where, listed(found), scope), record);
            }
            found.clear();
        };
        for (int output = 0; output < outputCount; ++output) {
            with(&Question::output, static_cast<OUTPUT_TYPE>(output), [&] {
                const Explanation explanation = explain(m_question);
                if (explanation.verdict != Conclusion::YES) {
                    return;
                }
                // The mode tables name each output by itself: their places would fill the screen.
                const SourceText* const place =
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

    static bool isSamePlace(const SourceText& left, const SourceText& right) {
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

    /// The multiboot arrangements that the device supports.
    void arrangements() {
        std::vector<std::string> found;
        multiboot::forEachArrangement([&](const std::string& type, const std::string& width, bool isLead) {
            Question other = m_question;
            other.multibootType = type;
            other.width = width;
            other.isLead = isLead;
            if (askFreshManager(other) == Conclusion::YES) {
                found.push_back(fmt::format("{} device of {} {}", isLead ? "lead" : "chain", type, width));
            }
        });
        if (!found.empty()) {
            add("instead", "yes as " + listed(found));
        }
    }

    /// The property that was meant, should the key be mistyped.
    void properties() {
        std::vector<std::string> keys;
        const auto addKeys = [&](const ReadLog& log, const std::string& key) {
            for (const ReadLog::Value& value : log.values()) {
                if (value.key == key) {
                    for (const ReadLog::Item& record : value.items) {
                        keys.push_back(record.field(0)->text);
                    }
                }
            }
        };
        const Inquiry asked(m_question);
        addKeys(asked.startUp, schema::propertyKey(m_question.device));
        addKeys(asked.reads, schema::PROPERTY);
        addKeys(asked.reads, schema::PROPERTIES);
        if (std::find(keys.begin(), keys.end(), m_question.property) != keys.end()) {
            return;
        }
        if (const std::optional<std::string> meant = suggest(m_question.property, keys)) {
            add("instead", fmt::format("there is a property {}", *meant));
        }
    }

    /// The devices of the same family that have another answer.
    void siblingDevices() {
        if (m_question.kind == Kind::OUTPUT || m_question.kind == Kind::DEVICE ||
            m_question.kind == Kind::DEVICE_THROUGH || m_question.kind == Kind::DEVICE_IN_MODE) {
            return;
        }
        packages();
        const std::string family = Inquiry(m_question).familyOf(m_question.device);
        if (isAnsweredForAll() || family == "base" || family == "spi") {
            return;
        }
        const std::string asked = withoutPackage(m_question.device);
        std::size_t siblings = 0;
        std::vector<std::string> found;
        const auto addIfYes = [&](const std::string& name, const std::string& shown) {
            with(&Question::device, name, [&] {
                if (isYes()) {
                    found.push_back(shown);
                }
            });
        };
        for (const std::string& name : AcdStore::devices(family)) {
            if (!sameWithoutCase(name, asked)) {
                ++siblings;
                addIfYes(name, name);
            }
        }
        if (siblings > 1 && found.size() == siblings) {
            add("differs", fmt::format("yes for the other {} devices of {}", siblings, family));
            return;
        }
        if (found.empty() && !sameWithoutCase(family, asked)) {
            addIfYes(family, "the family itself");
        }
        if (!found.empty()) {
            add("differs", fmt::format("in family {}, yes for {}", family, some(found)));
        }
    }

    /// The packages in which the device has options of its own.
    void packages() {
        if (m_question.kind != Kind::OPTION) {
            return;
        }
        std::vector<std::string> found;
        for (const std::string& name : catalogue::list(schema::BASE, schema::PROGRAM_OPTION_PACKAGE)) {
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

    Question m_question;
    std::vector<Step> m_steps;
};

} // namespace

std::vector<Step> alternatives(const Question& question) {
    std::vector<Step> steps;
    for (const Question& part : partsOf(question)) {
        if (askFreshManager(part) == Conclusion::NO) {
            const std::vector<Step> found = alternatives(part);
            if (!found.empty()) {
                steps.push_back({"part", "no: " + inWords(part)});
            }
            steps.insert(steps.end(), found.begin(), found.end());
        }
    }
    const std::vector<Step> whole = AlternativeFinder(question).run();
    steps.insert(steps.end(), whole.begin(), whole.end());
    return steps;
}

} // namespace explanation
