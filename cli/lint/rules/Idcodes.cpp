// Rules about IDCODE: the codes by which devices are told apart on the cable.
#include "lint/Findings.h"
#include "lint/rules/RuleSets.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <utility>

namespace lint {

namespace {

constexpr Rule MALFORMED_CODE{
    "D101", Level::ERROR, "IDCODE not of the form 0xHHHHHHHH",
    "An IDCODE is \"0x\" and eight hexadecimal digits, with X for a digit that does not matter.",
    "IDCODE = KS50,0x4104FB7"};
constexpr Rule BIT_0_CLEAR{
    "D102", Level::ERROR, "IDCODE with bit 0 clear",
    "Bit 0 of an identification code is always 1, which tells it from the bypass register; so the "
    "last digit is odd.",
    "IDCODE = KS50,0xX4104FB6"};
constexpr Rule AMBIGUOUS_CODE{
    "D103", Level::ERROR, "IDCODE of two devices",
    "There is a code that both entries match, digits that do not matter considered, so the "
    "devices can't be told apart.",
    "IDCODE = KS50,0xX4104FB7:KS100,0x14104FB7"};
constexpr Rule UNKNOWN_DEVICE{
    "D104", Level::ERROR, "IDCODE of an unknown device",
    "The name is none that a family's file has a section for, spelt so. Families and flashes "
    "have no IDCODE.",
    "IDCODE = ks50,0xX4104FB7"};
constexpr Rule NO_CODE{
    "D105", Level::ERROR, "device without an IDCODE",
    "Each device of a family has an IDCODE of its own in base.acd; one without is never recognised on "
    "the cable.",
    "# no KS75 in IDCODE\n[KS75]"};
constexpr Rule DEVICE_TWICE{"D106", Level::ERROR, "device given two IDCODEs",
                            "A device that is given twice keeps the last code; the first is lost.",
                            "IDCODE = KS50,0xX4104FB7:KS50,0xX4108FB7"};
constexpr Rule MALFORMED_ENTRY{
    "D107", Level::ERROR, "IDCODE entry that is not device and code",
    "An entry is a device, \",\" and its code; entries stand between \":\". A missing code is none; "
    "what stands behind it is never read.",
    "IDCODE = KS50,0xX4104FB7,KS100,0xX4108FB7"};

/// A code, and which of its bits matter.
struct Pattern {
    std::uint32_t bits = 0;
    std::uint32_t mask = 0;
};

std::optional<unsigned> digit(char byte) {
    if (byte >= '0' && byte <= '9') {
        return static_cast<unsigned>(byte - '0');
    }
    const char upper = byte >= 'a' && byte <= 'f' ? static_cast<char>(byte - 'a' + 'A') : byte;
    return upper >= 'A' && upper <= 'F' ? std::optional(static_cast<unsigned>(upper - 'A') + 10U)
                                        : std::nullopt;
}

std::optional<Pattern> patternOf(std::string_view text) {
    if (text.size() != 10 || !text.starts_with("0x")) {
        return std::nullopt;
    }
    Pattern pattern;
    for (const char byte : text.substr(2)) {
        const std::optional<unsigned> value = digit(byte);
        if (!value && byte != 'X') {
            return std::nullopt;
        }
        pattern.bits = (pattern.bits << 4U) | value.value_or(0);
        pattern.mask = (pattern.mask << 4U) | (value ? 0xFU : 0U);
    }
    return pattern;
}

/// Finds patterns that have a code in common. There are few different masks, however many codes there are.
class Codes {
public:
    struct Known {
        Pattern pattern;
        const Token* device;
    };

    /// The device of a code that this one has a code in common with; null when there is none.
    const Token* find(const Pattern& pattern) {
        for (const std::uint32_t mask : m_masks) {
            const std::uint32_t common = mask & pattern.mask;
            const auto& known = index(mask, common);
            if (const auto found = known.find(pattern.bits & common); found != known.end()) {
                return found->second;
            }
        }
        return nullptr;
    }

    void add(const Known& code) {
        m_masks.insert(code.pattern.mask);
        m_codes.push_back(code);
        for (auto& [masks, known] : m_indexes) {
            if (masks.first == code.pattern.mask) {
                known.emplace(code.pattern.bits & masks.second, code.device);
            }
        }
    }

private:
    using Index = std::map<std::uint32_t, const Token*>;

    /// The codes of one mask, by their bits under a narrower one.
    const Index& index(std::uint32_t mask, std::uint32_t common) {
        const auto [found, isNew] = m_indexes.try_emplace({mask, common});
        for (std::size_t i = 0; isNew && i < m_codes.size(); ++i) {
            if (m_codes[i].pattern.mask == mask) {
                found->second.emplace(m_codes[i].pattern.bits & common, m_codes[i].device);
            }
        }
        return found->second;
    }

    std::vector<Known> m_codes;
    std::set<std::uint32_t> m_masks;
    std::map<std::pair<std::uint32_t, std::uint32_t>, Index> m_indexes;
};

void checkCode(const Token& device, const Token& code, Codes& codes, Findings& findings) {
    const std::optional<Pattern> pattern = patternOf(code.text);
    if (!pattern) {
        findings.add(MALFORMED_CODE, code,
                     fmt::format("{} is not 0x and eight hexadecimal digits or X", quoted(code.text)));
        return;
    }
    if ((pattern->mask & 1U) != 0 && (pattern->bits & 1U) == 0) {
        findings.add(BIT_0_CLEAR, code, fmt::format("bit 0 of {} is clear", quoted(code.text)));
    }
    if (const Token* const other = codes.find(*pattern); other != nullptr && other->text != device.text) {
        findings.add(
            AMBIGUOUS_CODE, code,
            fmt::format("the IDCODE of {} matches that of {} too", quoted(device.text), quoted(other->text)));
    }
    codes.add({*pattern, &device});
}

void checkDevice(const Model& model, const Token& device, Findings& findings) {
    if (model.device(device.text) != nullptr) {
        return;
    }
    const bool isOther = model.isFamily(device.text) || model.isFlashInAnyCase(std::string(device.text));
    findings.add(UNKNOWN_DEVICE, device,
                 isOther ? fmt::format("{} is no device of a family, and has no IDCODE", quoted(device.text))
                         : fmt::format("unknown device {}{}", quoted(device.text),
                                       findings.didYouMean(device.text, model.deviceNames())));
}

void check(const Model& model, Findings& findings) {
    std::map<std::string_view, const AcdLines*> withCode;
    if (const Entry* const entry = model.baseEntry("IDCODE")) {
        Codes codes;
        for (const Record& record : entry->records) {
            const Token& device = record.fields.front();
            if (device.text.empty()) {
                continue;
            }
            checkDevice(model, device, findings);
            // A layer on top may well append another code.
            const AcdLines*& file = withCode[device.text];
            if (std::exchange(file, device.place.file) == device.place.file) {
                findings.add(DEVICE_TWICE, device,
                             fmt::format("the former IDCODE of {} is lost", quoted(device.text)));
            }
            if (record.fields.size() != 2) {
                findings.add(MALFORMED_ENTRY, record.fields.size() < 2 ? device : record.fields[2],
                             record.fields.size() < 2
                                 ? fmt::format("no code behind {}", quoted(device.text))
                                 : fmt::format("{} is never read: entries stand between \":\"",
                                               quoted(record.fields[2].text)));
            }
            if (record.fields.size() > 1 && !record.fields[1].text.empty()) {
                checkCode(device, record.fields[1], codes, findings);
            }
        }
    }
    for (const auto& [name, device] : model.devices()) {
        if (!withCode.contains(name)) {
            findings.add(NO_CODE, device.section->name,
                         fmt::format("IDCODE of base.acd lacks the device {}", quoted(name)));
        }
    }
}

} // namespace

Group idcodeRules() {
    return {{&MALFORMED_CODE, &BIT_0_CLEAR, &AMBIGUOUS_CODE, &UNKNOWN_DEVICE, &NO_CODE, &DEVICE_TWICE,
             &MALFORMED_ENTRY},
            check};
}

} // namespace lint
