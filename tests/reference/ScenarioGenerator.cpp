// Random scenarios, and how a failing one is made small: by cutting its text, which needs no memory of how the
// text was made.
#include "ScenarioGenerator.h"

#include "CallGenerator.h"
#include "ReferenceReader.h"

namespace reference {

namespace {

std::string joined(const std::vector<std::string>& pieces, char separator) {
    std::string text = pieces.empty() ? "" : pieces.front();
    for (std::size_t number = 1; number < pieces.size(); ++number) {
        text += separator + pieces[number];
    }
    return text;
}

/// The texts of these pieces; only those shorter than `text`, so that shrinking ends.
rc::Seq<std::string> shorterTexts(const std::string& text, char separator,
                                  const rc::Seq<std::vector<std::string>>& candidates) {
    return rc::seq::filter(
        rc::seq::map(candidates,
                     [=](const std::vector<std::string>& pieces) { return joined(pieces, separator); }),
        [=](const std::string& candidate) { return candidate.size() < text.size(); });
}

/// Fewer pieces of a line, as its separator parts it.
rc::Seq<std::string> fewerPieces(const std::string& line, char separator) {
    return shorterTexts(line, separator, rc::shrink::removeChunks(split(line, separator)));
}

rc::Seq<std::string> smallerLines(const std::string& line) {
    return rc::seq::concat(fewerPieces(line, ':'), fewerPieces(line, ','));
}

rc::Seq<std::string> smallerTexts(const std::string& text) {
    const std::vector<std::string> lines = split(text, '\n');
    return shorterTexts(
        text, '\n',
        rc::seq::concat(rc::shrink::removeChunks(lines), rc::shrink::eachElement(lines, smallerLines)));
}

rc::Seq<Scenario> withFewerCalls(const Scenario& scenario) {
    return rc::seq::map(rc::shrink::removeChunks(scenario.calls), [=](const std::vector<Call>& calls) {
        return Scenario{scenario.files, calls};
    });
}

Words fileNames(const Scenario& scenario) {
    Words names;
    for (const auto& [name, text] : scenario.files) {
        names.push_back(name);
    }
    return names;
}

rc::Seq<Scenario> withFewerFiles(const Scenario& scenario) {
    return rc::seq::map(rc::shrink::removeChunks(fileNames(scenario)), [=](const Words& names) {
        Scenario smaller{{}, scenario.calls};
        for (const std::string& name : names) {
            smaller.files[name] = scenario.files.at(name);
        }
        return smaller;
    });
}

rc::Seq<Scenario> withSmallerFiles(const Scenario& scenario) {
    return rc::seq::mapcat(rc::seq::fromContainer(fileNames(scenario)), [=](const std::string& name) {
        return rc::seq::map(smallerTexts(scenario.files.at(name)), [=](const std::string& text) {
            Scenario smaller = scenario;
            smaller.files[name] = text;
            return smaller;
        });
    });
}

rc::Seq<Argument> smallerArguments(const Argument& argument) {
    if (const int* number = std::get_if<int>(&argument)) {
        return rc::seq::map(rc::shrink::towards(*number, 0), [](int smaller) { return Argument(smaller); });
    }
    return {};
}

rc::Seq<Call> smallerCalls(const Call& call) {
    return rc::seq::map(rc::shrink::eachElement(call.arguments, smallerArguments),
                        [=](const std::vector<Argument>& arguments) {
                            return Call{call.method, arguments};
                        });
}

rc::Seq<Scenario> withSmallerCalls(const Scenario& scenario) {
    return rc::seq::map(rc::shrink::eachElement(scenario.calls, smallerCalls),
                        [=](const std::vector<Call>& calls) {
                            return Scenario{scenario.files, calls};
                        });
}

rc::Seq<Scenario> smallerScenarios(const Scenario& scenario) {
    return rc::seq::concat(withFewerCalls(scenario), withFewerFiles(scenario), withSmallerFiles(scenario),
                           withSmallerCalls(scenario));
}

} // namespace

rc::Gen<Scenario> scenarios(Health health, std::size_t calls) {
    return [=](const rc::Random& random, int /*size*/) {
        RandomSource pick(random);
        Scenario scenario{makeDatabases(pick, health), {}};
        for (std::size_t count = 0; count < calls; ++count) {
            scenario.calls.push_back(makeCall(pick));
        }
        return rc::shrinkable::shrinkRecur(scenario,
                                           [](const Scenario& larger) { return smallerScenarios(larger); });
    };
}

} // namespace reference
