// Writes random databases, calls, and what the reference answers, as JSON lines: what a binding in another language is
// compared with.
//
//     write_scenarios CALLS
//
// {"files": {NAME: TEXT}, "start": [MESSAGE], "calls": [{"method": NAME, "arguments": [...], "result": TEXT,
//   "messages": [MESSAGE]}]}, with a message as [CHANNEL, LINE, TEXT]. Texts are bytes: each is the character of that
// number. A line of -1, and a null in place of a text, stand for any.
#include "reference/CallRunner.h"
#include "reference/Reference.h"
#include "reference/ScenarioGenerator.h"

#include <nlohmann/json.hpp>

#include <cstdlib>
#include <iostream>
#include <stdexcept>

namespace {

using namespace reference;
using nlohmann::json;

constexpr int CALLS_PER_SCENARIO = 200;

/// Each byte as the character of that number, in UTF-8.
std::string fromBytes(const std::string& bytes) {
    std::string text;
    for (const char byte : bytes) {
        const auto code = static_cast<unsigned char>(byte);
        if (code < 0x80) {
            text += byte;
        } else {
            text += static_cast<char>(0xC0 | code >> 6);
            text += static_cast<char>(0x80 | (code & 0x3F));
        }
    }
    return text;
}

struct ArgumentWriter {
    json operator()(std::nullptr_t) const { return nullptr; }
    json operator()(bool value) const { return value; }
    json operator()(int value) const { return value; }
    json operator()(const std::string& text) const { return fromBytes(text); }
    json operator()(HeldText) const { throw std::logic_error("a held text in a call without any"); }
};

json written(const std::vector<Message>& messages) {
    json all = json::array();
    for (const Message& message : messages) {
        all.push_back({static_cast<int>(message.channel), message.line,
                       message.text ? json(fromBytes(*message.text)) : json(nullptr)});
    }
    return all;
}

json written(const Scenario& scenario) {
    Reference reference(scenario.files);
    json all{{"files", json::object()}, {"start", json::array()}, {"calls", json::array()}};
    for (const auto& [name, text] : scenario.files) {
        all["files"][fromBytes(name)] = fromBytes(text);
    }
    const std::vector<Message> start = reference.takeMessages();
    if (reference.databases().has("base.acd")) {
        all["start"] = written(start); // otherwise the database layer reports that
    }
    for (const Call& generated : scenario.calls) {
        const Call call = withoutHeldTexts(generated);
        json arguments = json::array();
        for (const Argument& argument : call.arguments) {
            arguments.push_back(std::visit(ArgumentWriter(), argument));
        }
        const Outcome outcome = ask(reference, call);
        all["calls"].push_back({{"method", signatures().at(static_cast<std::size_t>(call.method)).name},
                                {"arguments", arguments},
                                {"result", fromBytes(outcome.result)},
                                {"messages", written(outcome.messages)}});
    }
    return all;
}

} // namespace

int main(int argc, char** argv) {
    const int count = (argc == 2 ? std::atoi(argv[1]) : 0) / CALLS_PER_SCENARIO;
    for (int number = 0; number <= count; ++number) {
        const Health health = number % 2 == 0 ? Health::SOUND : Health::DAMAGED;
        const rc::Random random(static_cast<std::uint64_t>(number) + 40);
        std::cout << written(scenarios(health, CALLS_PER_SCENARIO)(random).value()).dump() << '\n';
    }
}
