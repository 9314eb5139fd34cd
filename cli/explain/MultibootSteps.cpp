// Multiboot arrangements: the lists of spi.acd.
#include "explain/ExplanationBuilder.h"

#include "text/Suggest.h"

#include <fmt/format.h>

namespace explanation {

bool ExplanationBuilder::multiboot() {
    const std::string key = fmt::format("{}_{}_{}", m_question.multibootType, m_question.width,
                                        m_question.isLead ? "LEAD" : "CHAIN");
    const ReadLog::Value* const devices = m_asked.startUp.find(key);
    if (devices == nullptr) {
        add("absent", fmt::format("there is no arrangement {}", key));
        return false;
    }
    for (const ReadLog::Item& device : devices->items) {
        if (sameWithoutCase(device.whole.text, m_question.device)) {
            add("record", fmt::format("{} lists {}", key, m_question.device), {devices, &device.whole});
            return true;
        }
    }
    if (devices->items.empty()) {
        add("absent", fmt::format("spi.acd has no list {}", key));
    } else {
        add("absent", fmt::format("{} does not list {}", key, m_question.device),
            {devices, &devices->items.front().whole});
    }
    return false;
}

} // namespace explanation
