#pragma once

#include <PM_DEVKEY.h>

#include <memory>
#include <string>

/// Opens a database. What it hands out goes with it, but for the accessor of the base database.
class [[gnu::visibility("default")]] AcdReader {
public:
    /// @throw DataNotFoundException when there is no base database
    AcdReader();
    explicit AcdReader(const char* name);
    ~AcdReader();
    AcdReader(const AcdReader&) = delete;
    AcdReader& operator=(const AcdReader&) = delete;

    [[nodiscard]] PM_DEVKEY* getDevkey() const;
    [[nodiscard]] const char* getPM() const;

private:
    std::shared_ptr<PM_DEVKEY> m_accessor;
    std::string m_module;
};
