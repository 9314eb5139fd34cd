#pragma once

#include <AcdStore.h>
#include <Port_MsgManData.h>

#include <map>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

/// One message that was issued, in a form that compares and prints.
struct IssuedMessage {
    Port_MsgManData::Channel channel;
    int line;
    std::string text;

    friend bool operator==(const IssuedMessage&, const IssuedMessage&) = default;
    friend std::ostream& operator<<(std::ostream& out, const IssuedMessage& message) {
        const char* const names[] = {"info", "status", "debug"};
        return out << names[static_cast<int>(message.channel)] << ' ' << message.line << " \"" << message.text
                   << '"';
    }
};

[[nodiscard]] inline IssuedMessage info(int line, std::string text) {
    return {Port_MsgManData::Channel::INFO, line, std::move(text)};
}
[[nodiscard]] inline IssuedMessage status(int line, std::string text) {
    return {Port_MsgManData::Channel::STATUS, line, std::move(text)};
}
[[nodiscard]] inline IssuedMessage debug(std::string text) {
    return {Port_MsgManData::Channel::DEBUG, 0, std::move(text)};
}

/// Takes all messages from its construction on.
class MessageRecorder {
public:
    MessageRecorder() {
        Port_MsgManData::setSink([this](const Port_MsgManData::Message& message) {
            m_messages.push_back({message.channel, message.line, std::string(message.text)});
        });
    }
    ~MessageRecorder() { Port_MsgManData::setSink({}); }
    MessageRecorder(const MessageRecorder&) = delete;
    MessageRecorder& operator=(const MessageRecorder&) = delete;

    /// What was issued since the last call.
    [[nodiscard]] std::vector<IssuedMessage> take() { return std::exchange(m_messages, {}); }

private:
    std::vector<IssuedMessage> m_messages;
};
