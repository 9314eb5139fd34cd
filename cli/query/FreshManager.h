#pragma once

#include <ManagerFactory.h>
#include <Port_MsgManData.h>

/// Drops all messages while it lives.
class MutedMessages {
public:
    MutedMessages() : m_former(Port_MsgManData::setSink([](const Port_MsgManData::Message&) {})) {}
    ~MutedMessages() { Port_MsgManData::setSink(std::move(m_former)); }
    MutedMessages(const MutedMessages&) = delete;
    MutedMessages& operator=(const MutedMessages&) = delete;

private:
    Port_MsgManData::Sink m_former;
};

/// Makes a manager that was asked nothing yet, with exceptions off.
[[nodiscard]] inline ManagerFactory::Manager freshManager() {
    ManagerFactory::Manager manager = ManagerFactory::make();
    manager->setExceptions(false);
    return manager;
}
