#pragma once

#include <Port_MsgManData.h>

#include "text/Json.h"

#include <string>
#include <vector>

/// Receives all messages of the manager and the host layer while it lives.
class Messages {
public:
    struct Message {
        Port_MsgManData::Channel channel;
        int line;
        std::string text;
    };

    Messages();
    ~Messages();
    Messages(const Messages&) = delete;
    Messages& operator=(const Messages&) = delete;

    /// Returns and removes the messages, in order.
    [[nodiscard]] std::vector<Message> take();

    /// Returns and removes the texts of the status channel, joined. Other messages stay.
    [[nodiscard]] std::string takeStatus();

    /// The number of messages since the last `take`.
    [[nodiscard]] std::size_t count() const noexcept { return m_messages.size(); }

    /// Drops all but the first `count`.
    void truncate(std::size_t count) { m_messages.resize(count); }

private:
    Port_MsgManData::Sink m_previous;
    std::vector<Message> m_messages;
};

/// An array of objects with channel, line and text.
[[nodiscard]] Json asJson(const std::vector<Messages::Message>& messages);
