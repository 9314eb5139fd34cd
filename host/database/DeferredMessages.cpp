#include "database/DeferredMessages.h"

#include <Port_MsgManData.h>

#include <utility>

// The one place where this layer issues messages.

namespace acd {

void DeferredMessages::add(std::string_view path, const ParseError& error) {
    m_messages.push_back({static_cast<int>(error.location.line),
                          printable(path) + ':' + std::to_string(error.location.line) + ':' +
                              std::to_string(error.location.column) + ": " + describe(error)});
}

void DeferredMessages::add(std::string_view path, int location, const char* reason) {
    m_messages.push_back({location, printable(path) + ": can't be read: " + reason});
}

void DeferredMessages::addMissingBase(const std::string& where) {
    m_messages.push_back({location::BASE_MISSING, "no base.acd " + printable(where)});
}

void DeferredMessages::addTooLate(const char* what) {
    m_messages.push_back({location::SET_TOO_LATE,
                          std::string(what) + " can't be set after databases were looked for: ignored"});
}

void DeferredMessages::issue() {
    while (!m_messages.empty()) {
        const Report report = std::move(m_messages.front());
        m_messages.pop_front();
        Port_MsgManData::createObject(PRODUCT, SOURCE, report.line, REVISION)
            .issueInfo("%s\n", report.text.c_str());
    }
}

} // namespace acd
