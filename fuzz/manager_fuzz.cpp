// Holds the whole manager against the reference: databases and calls are both made of the bytes.
//
// Up to the line "@calls" the bytes are database files, behind it each call is a byte for its method and one or
// more for each argument.
#include "Input.h"

#include "reference/CallRunner.h"

#include <limits>
#include <set>
#include <sstream>

namespace {

using reference::Argument;
using reference::Call;
using reference::Kind;
using reference::Scenario;

constexpr std::string_view CALLS_START = "@calls\n";
constexpr std::size_t MOST_CALLS = 64;

/// Dumps are long, and slow what has to be fast.
constexpr int MOST_DUMPS = 1;

bool isDump(reference::Method method) { return method >= reference::Method::DUMP_OPERATIONS_TABLE; }

/// Texts of arguments: mostly the words of the databases, so that questions and databases meet.
class Texts {
public:
    explicit Texts(const reference::Files& files) {
        std::set<std::string> words{""};
        for (const auto& [name, text] : files) {
            words.insert({name, name.substr(0, name.find('.'))});
            addWords(words, text);
        }
        m_words.assign(words.begin(), words.end());
    }

    [[nodiscard]] Argument take(fuzz::Input& input) const {
        enum : std::uint8_t {
            NOTHING = 0xFF,
            LITERAL = 0xFE,
            WITH_PACKAGE = 0xFD,
            UPPER = 0xFC,
            LOWER = 0xFB
        };
        switch (const std::uint8_t choice = input.byte().value_or(NOTHING)) {
        case NOTHING:
            return nullptr;
        case LITERAL:
            return std::string(input.upTo("\n"));
        case WITH_PACKAGE: {
            const std::string device = word(input);
            return device + "_" + word(input);
        }
        case UPPER:
            return reference::upper(word(input));
        case LOWER:
            return reference::lower(word(input));
        default:
            return m_words[choice % m_words.size()];
        }
    }

private:
    static void addWords(std::set<std::string>& words, const std::string& text) {
        constexpr const char* SEPARATORS = " \t\r\n=+:,[]\\#";
        for (std::size_t start = 0; start < text.size();) {
            const std::size_t end = std::min(text.find_first_of(SEPARATORS, start), text.size());
            words.insert(text.substr(start, end - start));
            start = end + 1;
        }
    }

    [[nodiscard]] const std::string& word(fuzz::Input& input) const {
        return m_words[input.byte().value_or(0) % m_words.size()];
    }

    std::vector<std::string> m_words;
};

int takeNumber(fuzz::Input& input) {
    using Limits = std::numeric_limits<int>;
    const auto number = static_cast<signed char>(input.byte().value_or(0));
    if (number == std::numeric_limits<signed char>::max()) {
        return Limits::max();
    }
    return number == std::numeric_limits<signed char>::min() ? Limits::min() : number;
}

Argument takeArgument(fuzz::Input& input, const Texts& texts, Kind kind) {
    switch (kind) {
    case Kind::SWITCH:
    case Kind::LEAD:
    case Kind::RECORDER:
        return input.byte().value_or(0) % 2 == 1;
    case Kind::MODE:
    case Kind::OUTPUT:
    case Kind::OPERATION:
    case Kind::OPTION:
        return takeNumber(input);
    default:
        return texts.take(input);
    }
}

Scenario scenarioOf(fuzz::Input input) {
    Scenario scenario{fuzz::filesIn(input.upTo(CALLS_START)), {}};
    const Texts texts(scenario.files);
    int dumps = 0;
    while (scenario.calls.size() < MOST_CALLS) {
        const std::optional<std::uint8_t> choice = input.byte();
        if (!choice) {
            break;
        }
        const reference::Signature& signature =
            reference::signatures()[*choice % reference::signatures().size()];
        Call call{signature.method, {}};
        for (const Kind kind : signature.arguments) {
            call.arguments.push_back(takeArgument(input, texts, kind));
        }
        dumps += isDump(call.method) ? 1 : 0;
        if (!isDump(call.method) || dumps <= MOST_DUMPS) {
            scenario.calls.push_back(std::move(call));
        }
    }
    return scenario;
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const Scenario scenario = scenarioOf({data, size});
    const std::string found = reference::difference(scenario, reference::Ending::MEMBERS);
    if (!found.empty()) {
        std::ostringstream test;
        test << found << "\nas a test:\n" << scenario;
        fuzz::fail(test.str());
    }
    return 0;
}
