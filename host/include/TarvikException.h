#pragma once

#include <exception>

namespace Port {

/// The root of everything that the host libraries and their users raise.
class __attribute__((visibility("default"))) Exception : public std::exception {
public:
    ~Exception() override;
};

} // namespace Port

/// A failure with its place of origin. Thrown by value; copying never fails.
///
/// The texts handed to a constructor must outlive the exception: pass constants.
class __attribute__((visibility("default"))) TarvikException : public Port::Exception {
public:
    /// A failure at a place.
    /// @param product that fails
    /// @param source of the place
    /// @param revision of the source
    /// @param line the location number of the place
    TarvikException(const char* product, const char* source, const char* revision, int line) noexcept;
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
    [[nodiscard]] const char* what() const noexcept override;

    /// Issues one info message with the exception's type and its place of origin.
    virtual void report() const;

private:
    const char* m_product;
    const char* m_source;
    const char* m_revision;
    int m_line;
};

/// A failure of the data or of the call, rather than of the machine.
class __attribute__((visibility("default"))) LogicException : public TarvikException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    using TarvikException::TarvikException;
    ~LogicException() override;
    /// @return the name of the exception's type
    [[nodiscard]] const char* what() const noexcept override;
};

/// A record of the database does not have the form it must have.
class __attribute__((visibility("default"))) DataMismatchException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    using LogicException::LogicException;
    ~DataMismatchException() override;
    /// @return the name of the exception's type
    [[nodiscard]] const char* what() const noexcept override;
};

/// A value or a name lies outside what there is.
class __attribute__((visibility("default"))) OutOfRangeException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    using LogicException::LogicException;
    ~OutOfRangeException() override;
    /// @return the name of the exception's type
    [[nodiscard]] const char* what() const noexcept override;
};

/// Data that must be there is not there, or can't be read.
class __attribute__((visibility("default"))) DataNotFoundException : public LogicException {
public:
    /// @copydoc TarvikException::TarvikException(const char*, const char*, const char*, int)
    using LogicException::LogicException;
    ~DataNotFoundException() override;
    /// @return the name of the exception's type
    [[nodiscard]] const char* what() const noexcept override;
};
