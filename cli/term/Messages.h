#pragma once

#include <Port_MsgManData.h>

#include "text/Json.h"

#include <string>
#include <vector>

/// Takes all messages of the manager and the host layer, from its construction to its end.
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

    /// What was issued since the last call, in order.
    [[nodiscard]] std::vector<Message> take();

    /// What was issued on the status channel since the last call, joined. Other messages stay.
    [[nodiscard]] std::string takeStatus();

    /// How many were issued since the last `take`.
    [[nodiscard]] std::size_t count() const noexcept { return m_messages.size(); }

    /// Forgets all but the first `count`.
    void forgetBehind(std::size_t count) { m_messages.resize(count); }

private:
    Port_MsgManData::Sink m_former;
    std::vector<Message> m_messages;
};

/// An array of objects that name channel, line and text.
[[nodiscard]] Json asJson(const std::vector<Messages::Message>& messages);
