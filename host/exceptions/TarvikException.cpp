#include "TarvikException.h"

#include "Port_MsgManData.h"
#include "database/ReadLog.h"
#include "text/NullToEmpty.h"

#include <utility>

// The exceptions. Their destructors stand here so that each type has one home, and is caught across libraries.

Port::Exception::~Exception() = default;

TarvikException::TarvikException(const char* typeName, const char* product, const char* source,
                                 const char* revision, int line) noexcept
    : m_typeName(nullToEmpty(typeName)), m_product(nullToEmpty(product)), m_source(nullToEmpty(source)),
      m_revision(nullToEmpty(revision)), m_line(line) {
    try {
        std::string text = m_typeName;
        text.append(" at ").append(m_source).append(", line ").append(std::to_string(m_line));
        if (const std::string read = acd::ReadLog::describeLatest(); !read.empty()) {
            text.append("; last read: ").append(read);
        }
        m_text = std::make_shared<const std::string>(std::move(text));
    } catch (const std::exception&) {
        // No memory: the type has to do.
    }
}

TarvikException::~TarvikException() = default;

const char* TarvikException::what() const noexcept {
    return m_text == nullptr ? m_typeName : m_text->c_str();
}

void TarvikException::report() const {
    Port_MsgManData::createObject(m_product, m_source, m_line, m_revision)
        .issueInfo("%s raised by %s at %s, line %d\n", m_typeName, m_product, m_source, m_line);
}

LogicException::~LogicException() = default;
DataMismatchException::~DataMismatchException() = default;
OutOfRangeException::~OutOfRangeException() = default;
DataNotFoundException::~DataNotFoundException() = default;
