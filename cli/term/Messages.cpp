// Gathers the messages of the manager, so that each kind of output can place them.
#include "term/Messages.h"

#include <utility>

namespace {

using Channel = Port_MsgManData::Channel;

const char* channelName(Channel channel) {
    switch (channel) {
    case Channel::INFO:
        return "info";
    case Channel::STATUS:
        return "status";
    case Channel::DEBUG:
        break;
    }
    return "debug";
}

} // namespace

Messages::Messages()
    : m_previous(Port_MsgManData::setSink([this](const Port_MsgManData::Message& message) {
          m_messages.push_back({message.channel, message.line, std::string(message.text)});
      })) {}

Messages::~Messages() { Port_MsgManData::setSink(std::move(m_previous)); }

std::vector<Messages::Message> Messages::take() { return std::exchange(m_messages, {}); }

std::string Messages::takeStatus() {
    std::string joined;
    std::vector<Message> others;
    for (Message& message : take()) {
        if (message.channel == Channel::STATUS) {
            joined += message.text;
        } else {
            others.push_back(std::move(message));
        }
    }
    m_messages = std::move(others);
    return joined;
}

Json asJson(const std::vector<Messages::Message>& messages) {
    Json list = Json::array();
    for (const Messages::Message& message : messages) {
        list.push_back(
            {{"channel", channelName(message.channel)}, {"line", message.line}, {"text", message.text}});
    }
    return list;
}
