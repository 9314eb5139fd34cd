#include <HostCall.h>
#include <MemoryDatabases.h>
#include <Port_MsgManData.h>
#include <TarvikException.h>

#include <utility>

// What is said through the in-memory host: messages, and the exceptions with their reports.

namespace {

std::vector<memory_host::Message>& messages() {
    static std::vector<memory_host::Message> kept;
    return kept;
}

} // namespace

std::vector<memory_host::Message> memory_host::takeMessages() { return std::exchange(messages(), {}); }

Port_MsgManData Port_MsgManData::createObject(const char* /*product*/, const char* /*source*/, int line,
                                              const char* /*revision*/) {
    hostCall("createObject");
    return Port_MsgManData(line);
}

void Port_MsgManData::issue(memory_host::Message message) {
    hostCall("issue");
    messages().push_back(std::move(message));
}

Port::Exception::~Exception() = default;
TarvikException::~TarvikException() = default;
LogicException::~LogicException() = default;
DataMismatchException::~DataMismatchException() = default;
OutOfRangeException::~OutOfRangeException() = default;
DataNotFoundException::~DataNotFoundException() = default;

void TarvikException::report() const {
    Port_MsgManData::createObject("", "", m_line, "").issueInfo("raised at %d\n", m_line);
}
