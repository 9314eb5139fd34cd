#include "TarvikException.h"

#include "Port_MsgManData.h"
#include "text/NullToEmpty.h"

// The exceptions. Their destructors stand here so that each type has one home, and is caught across libraries.

Port::Exception::~Exception() = default;

TarvikException::TarvikException(const char* product, const char* source, const char* revision,
                                 int line) noexcept
    : m_product(nullToEmpty(product)), m_source(nullToEmpty(source)), m_revision(nullToEmpty(revision)),
      m_line(line) {}

TarvikException::~TarvikException() = default;

const char* TarvikException::what() const noexcept { return "TarvikException"; }

void TarvikException::report() const {
    Port_MsgManData::createObject(m_product, m_source, m_line, m_revision)
        .issueInfo("%s raised by %s at %s, line %d\n", what(), m_product, m_source, m_line);
}

LogicException::~LogicException() = default;
const char* LogicException::what() const noexcept { return "LogicException"; }

DataMismatchException::~DataMismatchException() = default;
const char* DataMismatchException::what() const noexcept { return "DataMismatchException"; }

OutOfRangeException::~OutOfRangeException() = default;
const char* OutOfRangeException::what() const noexcept { return "OutOfRangeException"; }

DataNotFoundException::~DataNotFoundException() = default;
const char* DataNotFoundException::what() const noexcept { return "DataNotFoundException"; }
