#pragma once

#include <exception>

namespace Port {

class [[gnu::visibility("default")]] Exception : public std::exception {
public:
    ~Exception() override;
};

} // namespace Port

class [[gnu::visibility("default")]] TarvikException : public Port::Exception {
public:
    TarvikException(const char* /*product*/, const char* /*source*/, const char* /*revision*/,
                    int line) noexcept
        : m_line(line) {}
    ~TarvikException() override;

    [[nodiscard]] int line() const noexcept { return m_line; }

    /// Issues an info message with the location.
    virtual void report() const;

private:
    int m_line;
};

class [[gnu::visibility("default")]] LogicException : public TarvikException {
public:
    using TarvikException::TarvikException;
    ~LogicException() override;
};

class [[gnu::visibility("default")]] DataMismatchException : public LogicException {
public:
    using LogicException::LogicException;
    ~DataMismatchException() override;
};

class [[gnu::visibility("default")]] OutOfRangeException : public LogicException {
public:
    using LogicException::LogicException;
    ~OutOfRangeException() override;
};

class [[gnu::visibility("default")]] DataNotFoundException : public LogicException {
public:
    using LogicException::LogicException;
    ~DataNotFoundException() override;
};
