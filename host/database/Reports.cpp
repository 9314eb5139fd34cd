#include "database/Reports.h"

#include <Port_MsgManData.h>

#include <utility>

// The one place where this layer issues messages.

namespace acd {

void Reports::add(std::string_view path, const Fault& fault) {
    m_reports.push_back({static_cast<int>(fault.place.line),
                         printable(path) + ':' + std::to_string(fault.place.line) + ':' +
                             std::to_string(fault.place.column) + ": " + describe(fault)});
}

void Reports::add(std::string_view path, int location, const char* reason) {
    m_reports.push_back({location, printable(path) + ": can't be read: " + reason});
}

void Reports::addMissingBase(const std::string& where) {
    m_reports.push_back({location::BASE_MISSING, "no base.acd " + printable(where)});
}

void Reports::issue() {
    while (!m_reports.empty()) {
        const Report report = std::move(m_reports.front());
        m_reports.pop_front();
        Port_MsgManData::createObject(PRODUCT, SOURCE, report.line, REVISION)
            .issueInfo("%s\n", report.text.c_str());
    }
}

} // namespace acd
