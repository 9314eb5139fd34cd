#pragma once

#include <map>
#include <memory>
#include <string>

class PM_PIC;

namespace memory_host {
struct Database;
}

/// Reads keyed values of one database.
class [[gnu::visibility("default")]] PM_DEVKEY {
public:
    PM_DEVKEY(const char* file, const PM_PIC& configuration, unsigned char flag1, unsigned char flag2,
              unsigned char flag3);
    explicit PM_DEVKEY(const char* name);

    /// The text is freed by the next call.
    [[nodiscard]] const char* getstringbykey(const char* key, const char* separator, short index,
                                             const char* subSeparator, short subIndex);

private:
    std::string m_name;
    std::map<std::string, std::string> m_values;
    std::unique_ptr<std::string> m_result;
};
