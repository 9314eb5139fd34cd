// Makes up calls of all exported methods, mostly about what random databases hold.
#include "CallGenerator.h"

#include "ReferenceReader.h"
#include "Words.h"

#include <limits>

namespace reference {

namespace {

/// A number from 0 to `count` - 1, now and then another one.
int number(RandomSource& pick, int count) {
    if (pick.chance(10)) {
        return pick.from(std::vector<int>{-1, count, count + 1, 32, 255, -2147483647 - 1,
                                          std::numeric_limits<int>::max()});
    }
    return pick.below(count);
}

std::string changedCase(RandomSource& pick, const std::string& text) {
    return pick.chance(50) ? upper(text) : lower(text);
}

std::string device(RandomSource& pick) {
    std::string name;
    switch (pick.below(20)) {
    case 0:
        name = pick.from(words::NOISE);
        break;
    case 1:
        name = pick.from(Words{"spi", "SPI", "base", "BASE", "spi.acd", "kes.acd", "../kes"});
        break;
    case 2:
    case 3:
    case 4:
        name = pick.from(words::SPI_NAMES);
        break;
    case 5:
    case 6:
    case 7:
    case 8:
        name = pick.from(words::FAMILIES);
        break;
    default:
        name = pick.from(words::DEVICES);
    }
    if (pick.chance(15)) {
        name = changedCase(pick, name);
    }
    if (pick.chance(20)) {
        name += "_" + pick.from(words::PACKAGES);
    }
    return name;
}

std::string word(RandomSource& pick, const Words& words, const Words& others = words::NOISE) {
    std::string text = pick.chance(8) ? pick.from(others) : pick.from(words);
    return pick.chance(5) ? changedCase(pick, text) : text;
}

Argument orNull(RandomSource& pick, int percent, std::string text) {
    return pick.chance(percent) ? Argument(nullptr) : Argument(std::move(text));
}

bool isText(Kind kind) {
    switch (kind) {
        using enum Kind;
    case SWITCH:
    case LEAD:
    case RECORDER:
    case MODE:
    case OUTPUT:
    case OPERATION:
    case OPTION:
        return false;
    default:
        return true;
    }
}

Argument makeArgument(RandomSource& pick, Kind kind) {
    constexpr int RARELY = 2;
    if (isText(kind) && pick.chance(6)) {
        return HeldText{static_cast<std::size_t>(pick.below(1000))};
    }
    switch (kind) {
        using enum Kind;
    case SWITCH:
    case LEAD:
    case RECORDER:
        return pick.chance(50);
    case DEVICE:
        return orNull(pick, RARELY, device(pick));
    case SPI_DEVICE:
        return orNull(pick, RARELY,
                      pick.chance(20) ? device(pick) : changedCase(pick, pick.from(words::SPI_NAMES)));
    case FAMILY:
        return orNull(pick, RARELY, word(pick, pick.chance(75) ? words::FAMILIES : words::OTHER_FAMILIES));
    case PACKAGE:
        return orNull(pick, 40, word(pick, words::PACKAGES));
    case PROPERTY:
        return orNull(pick, RARELY,
                      word(pick, pick.from(std::vector<Words>{words::PROPERTIES, words::OPERATION_PROPERTIES,
                                                              words::OPTION_PROPERTIES})));
    case OPERATION_PROPERTY:
        return orNull(pick, RARELY, word(pick, words::OPERATION_PROPERTIES, words::OPERATION_NAMES));
    case SPI_PROPERTY:
        return orNull(pick, RARELY, word(pick, words::SPI_PROPERTIES));
    case MODE:
        return pick.chance(60) ? pick.from(std::vector<int>{0, 0, 1, 5, 2}) : number(pick, 9);
    case OUTPUT:
        return number(pick, pick.chance(70) ? 5 : 10);
    case OPERATION:
        return pick.chance(50) ? pick.from(std::vector<int>{0, 0, 3, 3, 4, 9, 19, 20, 30, 31})
                               : number(pick, 32);
    case OPTION:
        return number(pick, 24);
    case MODE_NAME:
        return orNull(pick, RARELY, word(pick, words::MODE_NAMES));
    case OUTPUT_NAME:
        return orNull(pick, RARELY, word(pick, words::OUTPUT_NAMES, words::UNKNOWN_OUTPUT_NAMES));
    case OPERATION_NAME:
        return orNull(pick, RARELY, word(pick, words::OPERATION_NAMES));
    case DISPLAY_NAME:
        return orNull(pick, RARELY, word(pick, words::DISPLAY_NAMES));
    case OPTION_NAME:
        return orNull(pick, RARELY, word(pick, words::OPTION_NAMES, words::UNKNOWN_OPTION_NAMES));
    case TYPE_PREFIX:
        return orNull(pick, RARELY, word(pick, words::TYPE_PREFIXES));
    case WIDTH:
        return orNull(pick, RARELY, word(pick, words::WIDTHS));
    }
    return nullptr;
}

/// Each signature as often as its weight says.
const std::vector<const Signature*>& weighted() {
    static const std::vector<const Signature*> WEIGHTED = [] {
        std::vector<const Signature*> all;
        for (const Signature& signature : signatures()) {
            all.insert(all.end(), signature.weight, &signature);
        }
        return all;
    }();
    return WEIGHTED;
}

} // namespace

Call makeCall(RandomSource& pick) {
    const Signature& signature = *pick.from(weighted());
    Call call{signature.method, {}};
    for (const Kind kind : signature.arguments) {
        call.arguments.push_back(makeArgument(pick, kind));
    }
    return call;
}

} // namespace reference
