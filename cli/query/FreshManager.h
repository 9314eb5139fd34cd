#pragma once

#include <ManagerFactory.h>
#include <Port_MsgManData.h>

/// Gives all messages to another sink while it lives.
class ReplacedSink {
public:
    explicit ReplacedSink(Port_MsgManData::Sink sink) : m_former(Port_MsgManData::setSink(std::move(sink))) {}
    ~ReplacedSink() { Port_MsgManData::setSink(std::move(m_former)); }
    ReplacedSink(const ReplacedSink&) = delete;
    ReplacedSink& operator=(const ReplacedSink&) = delete;

private:
    Port_MsgManData::Sink m_former;
};

/// Drops all messages while it lives.
class MutedMessages : ReplacedSink {
public:
    MutedMessages() : ReplacedSink([](const Port_MsgManData::Message&) {}) {}
};

/// Makes a manager that was asked nothing yet, with exceptions off.
[[nodiscard]] inline ManagerFactory::Manager freshManager() {
    ManagerFactory::Manager manager = ManagerFactory::make();
    manager->setExceptions(false);
    return manager;
}
