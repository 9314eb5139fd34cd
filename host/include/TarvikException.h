#pragma once

#include "TarvikAbi.h"

#include <tarvik/Attributes.h>

#include <exception>
#include <memory>
#include <string>

namespace Port {

/// The root of everything that the host libraries and their users raise.
class TARVIK_HOST_API Exception : public std::exception {
public:
    ~Exception() override;
};

} // namespace Port

/// A failure with its place of origin. Thrown by value; copying never fails.
///
/// The texts handed to a constructor must outlive the exception: pass constants.
class TARVIK_HOST_API TarvikException : public Port::Exception {
public:
    /// A failure at a place.
    /// @param product that fails
    /// @param source of the place
    /// @param revision of the source
    /// @param line the location number of the place
    TarvikException(const char* product, const char* source, const char* revision, int line) noexcept
        : TarvikException("TarvikException", product, source, revision, line) {}
    ~TarvikException() override;

    /// @return the product that failed
    [[nodiscard]] const char* product() const noexcept { return m_product; }
    /// @return the source of the place
    [[nodiscard]] const char* source() const noexcept { return m_source; }
    /// @return the revision of that source
    [[nodiscard]] const char* revision() const noexcept { return m_revision; }

    /// @return the location number of the raising site
    [[nodiscard]] int line() const noexcept { return m_line; }

    /// @return the name of the exception's type
    [[nodiscard]] const char* typeName() const noexcept { return m_typeName; }

    /// What happened, in one line: the type, the source and the location number, and the value that was read last
    /// from a database, with its file, line and column ("OutOfRangeException at ../s/ConstraintsManager, line
    /// 1631; last read: /db/kestrel.acd:12:5: OPERATION, item 3, field 0: 'PROGRM'"). Items and fields are
    /// counted from 0. The last read is left out if nothing was read since a database was opened last.
    /// @return the text, which lives as long as this exception and its copies; the type alone without memory
    [[nodiscard]] const char* what() const noexcept override;

    /// Issues one info message with the exception's type and its place of origin.
    virtual void report() const;

protected:
    /// A failure of a type that derives from this one.
    /// @param typeName of that type
    /// @param product that fails
    /// @param source of the place
    /// @param revision of the source
    /// @param line the location number of the place
    TarvikException(const char* typeName, const char* product, const char* source, const char* revision,
                    int line) noexcept;

private:
    const char* m_typeName;
    const char* m_product;
    const char* m_source;
    const char* m_revision;
    int m_line;
    std::shared_ptr<const std::string> m_text; ///< null if there was no memory for it
};

/// A failure of the data or of the call, rather than of the machine.
class TARVIK_HOST_API LogicException : public TarvikException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    LogicException(const char* product, const char* source, const char* revision, int line) noexcept
        : TarvikException("LogicException", product, source, revision, line) {}
    ~LogicException() override;

protected:
    using TarvikException::TarvikException;
};

/// A record of the database does not have the form it must have.
class TARVIK_HOST_API DataMismatchException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    DataMismatchException(const char* product, const char* source, const char* revision, int line) noexcept
        : LogicException("DataMismatchException", product, source, revision, line) {}
    ~DataMismatchException() override;
};

/// A value or a name lies outside what there is.
class TARVIK_HOST_API OutOfRangeException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    OutOfRangeException(const char* product, const char* source, const char* revision, int line) noexcept
        : LogicException("OutOfRangeException", product, source, revision, line) {}
    ~OutOfRangeException() override;
};

/// Data that must be there is not there, or can't be read.
class TARVIK_HOST_API DataNotFoundException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    DataNotFoundException(const char* product, const char* source, const char* revision, int line) noexcept
        : LogicException("DataNotFoundException", product, source, revision, line) {}
    ~DataNotFoundException() override;
};
