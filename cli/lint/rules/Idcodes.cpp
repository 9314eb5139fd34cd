// Rules about IDCODE: the codes that identify devices on the cable.
#include "lint/FamilyResult.h"
#include "lint/rules/RuleSets.h"

#include "model/IdcodePattern.h"
#include "text/Suggest.h"

#include <algorithm>
#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <unordered_map>
#include <utility>

namespace lint {

namespace {

constexpr Rule MALFORMED_CODE{
    "D101",
    "malformed-idcode",
    Severity::ERROR,
    "IDCODE not of the form 0xHHHHHHHH",
    R"(An IDCODE is "0x" and eight hexadecimal digits, with X for a digit that can have any value.)",
    "IDCODE = KS50,0x4104FB7"};
constexpr Rule BIT_0_CLEAR{
    "D102",
    "idcode-bit-0-clear",
    Severity::ERROR,
    "IDCODE with bit 0 clear",
    R"(Bit 0 of an identification code is always 1, which distinguishes it from the bypass register; so the last digit
is odd.)",
    "IDCODE = KS50,0xX4104FB6"};
constexpr Rule AMBIGUOUS_CODE{
    "D103",
    "ambiguous-idcode",
    Severity::ERROR,
    "IDCODE of two devices",
    R"(Some code matches both entries, their X digits considered, so the two devices cannot be distinguished.)",
    "IDCODE = KS50,0xX4104FB7:KS100,0x14104FB7"};
constexpr Rule UNKNOWN_DEVICE{
    "D104",
    "idcode-of-unknown-device",
    Severity::ERROR,
    "IDCODE of an unknown device",
    R"(No family's file has a section of exactly this name. Families and flashes have no IDCODE.)",
    "IDCODE = ks50,0xX4104FB7",
    true};
constexpr Rule NO_CODE{
    "D105",
    "no-idcode",
    Severity::ERROR,
    "device without an IDCODE",
    R"(Each device of a family needs an IDCODE of its own in base.acd. A device without one is never recognised on the
cable.)",
    "# no KS75 in IDCODE\n[KS75]"};
constexpr Rule DEVICE_TWICE{"D106",
                            "two-idcodes",
                            Severity::ERROR,
                            "device with two IDCODEs",
                            "Of two IDCODEs of one device the last is used; the first is lost.",
                            "IDCODE = KS50,0xX4104FB7:KS50,0xX4108FB7"};
constexpr Rule MALFORMED_ENTRY{
    "D107",
    "malformed-idcode-entry",
    Severity::ERROR,
    "IDCODE entry that is not device and code",
    R"(An entry is a device, "," and its code; entries are separated by ":". Without a code the device has an empty
one, and fields after the code are not read.)",
    "IDCODE = KS50,0xX4104FB7,KS100,0xX4108FB7"};

/// The pattern of a code in the form that the manager expects: "0x" and eight digits, any digit as "X".
std::optional<IdcodePattern> patternOf(std::string_view text) {
    constexpr std::size_t LENGTH = 10;
    const bool isComplete = text.size() == LENGTH && text.starts_with("0x");
    const bool hasOtherX = text.find('x', 2) != std::string_view::npos;
    return isComplete && !hasOtherX ? readIdcode(text) : std::nullopt;
}

/// With "0x" and "X" as they must be.
std::string inUsualCase(std::string_view text) {
    std::string code = upperCase(text);
    if (code.size() > 1 && code[1] == 'X') {
        code[1] = 'x';
    }
    return code;
}

/// Finds patterns that match a common code. There are few different masks, however many codes there are.
class IdcodeIndex {
public:
    struct Known {
        IdcodePattern pattern;
        const Token* device;
    };

    /// A device whose pattern matches a code that this one matches, too; null when there is none.
    const Token* find(const IdcodePattern& pattern) {
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

void checkCode(const Token& device, const Token& code, bool counts, IdcodeIndex& codes, Findings& findings) {
    const std::optional<IdcodePattern> pattern = patternOf(code.text);
    if (!pattern) {
        findings
            .add(MALFORMED_CODE, code, "{} is not 0x and eight hexadecimal digits or X", inQuotes(code.text))
            .fix = patternOf(inUsualCase(code.text)) ? replacing(code, inUsualCase(code.text)) : std::nullopt;
        return;
    }
    if ((pattern->mask & 1U) != 0 && (pattern->bits & 1U) == 0) {
        findings.add(BIT_0_CLEAR, code, "bit 0 of {} is clear", inQuotes(code.text));
    }
    if (!counts) {
        return;
    }
    if (const Token* const other = codes.find(*pattern); other != nullptr && other->text != device.text) {
        findings.add(AMBIGUOUS_CODE, code, "the IDCODE of {} matches that of {} too", inQuotes(device.text),
                     inQuotes(other->text));
    }
    codes.add({*pattern, &device});
}

void checkDevice(const Model& model, const Token& device, const std::vector<Token>& used,
                 Findings& findings) {
    if (model.device(device.text) != nullptr) {
        return;
    }
    if (model.isFamily(device.text) || model.isFlashInAnyCase(std::string(device.text))) {
        findings.add(UNKNOWN_DEVICE, device, "{} is not a device of a family, so it has no IDCODE",
                     inQuotes(device.text));
    } else {
        const Suggestion suggestion = findings.suggest(device.text, model.deviceNames(), used);
        findings
            .addUnknown(UNKNOWN_DEVICE, device, device, suggestion, "unknown device {}",
                        inQuotes(device.text))
            .reports = fact::inList(suggestion.name.value_or(""), schema::IDCODE);
    }
}

void check(const Model& model, const FamilyResults& /*any*/, Findings& findings) {
    const std::vector<Item>& items = model.baseKeys().items(schema::IDCODE);
    std::unordered_map<std::string_view, const AcdLines*> withCode(items.size());
    // Only the last code of a device counts: a layer on top may give its former code to another device.
    std::unordered_map<std::string_view, const Token*> last(items.size());
    std::vector<Token> used;
    for (const Item& item : items) {
        last.insert_or_assign(item.fields.front().text, &item.fields.front());
        used.push_back(item.fields.front());
    }
    IdcodeIndex codes;
    for (const Item& item : items) {
        const std::vector<Token>& fields = item.fields;
        const Token& device = fields.front();
        if (device.text.empty()) {
            continue;
        }
        checkDevice(model, device, used, findings);
        // A layer on top may append another code on purpose.
        const AcdLines*& file = withCode[device.text];
        if (std::exchange(file, device.location.file) == device.location.file) {
            findings.add(DEVICE_TWICE, device, "the former IDCODE of {} is lost", inQuotes(device.text));
        }
        if (fields.size() < 2) {
            findings.add(MALFORMED_ENTRY, device, "no code after {}", inQuotes(device.text));
        } else if (fields.size() > 2) {
            findings.add(MALFORMED_ENTRY, fields[2], "{} is never read: entries are separated by \":\"",
                         inQuotes(fields[2].text));
        }
        if (fields.size() > 1 && !fields[1].text.empty()) {
            checkCode(device, fields[1],
                      last[device.text] == &device ||
                          item.whole.location.file == last[device.text]->location.file,
                      codes, findings);
        }
    }
    for (const Device& device : model.devices()) {
        const std::string_view name = device.section->name.text;
        if (!withCode.contains(name)) {
            findings
                .add(NO_CODE, device.section->name, "IDCODE of base.acd lacks the device {}", inQuotes(name))
                .restsOn = fact::inList(name, schema::IDCODE);
        }
    }
}

} // namespace

RuleSet idcodeRules() {
    return {"IDCODEs",
            {&MALFORMED_CODE, &BIT_0_CLEAR, &AMBIGUOUS_CODE, &UNKNOWN_DEVICE, &NO_CODE, &DEVICE_TWICE,
             &MALFORMED_ENTRY},
            nullptr,
            check};
}

} // namespace lint
