#include "Lists.h"
#include "Reporting.h"
#include "SpiClasses.h"

#include <tarvik/ConstraintsManager.h>

#include <array>

// Which devices support which multiboot arrangement.

namespace {

/// Flash path, width and position in the chain, in the order in which they are read.
constexpr std::array<const char*, 12> TYPES{
    "TYPE_BPI_SERIAL_LEAD",       "TYPE_BPI_SERIAL_CHAIN",    "TYPE_BPI_PARALLEL_LEAD",
    "TYPE_BPI_PARALLEL_CHAIN",    "TYPE_MB_SPI_NONE_LEAD",    "TYPE_MB_SPI_NONE_CHAIN",
    "TYPE_MB_BPI_SERIAL_LEAD",    "TYPE_MB_BPI_SERIAL_CHAIN", "TYPE_MB_BPI_PARALLEL_LEAD",
    "TYPE_MB_BPI_PARALLEL_CHAIN", "TYPE_MB_QPRM_NONE_LEAD",   "TYPE_MB_QPRM_NONE_CHAIN",
};

} // namespace

void ConstraintsManager::readMultibootTypes(PM_DEVKEY* accessor) {
    for (const char* const type : TYPES) {
        m_multibootTypes[type] = readList(*accessor, type);
    }
}

bool ConstraintsManager::isMbBpiSpiSupport(const char* device, const char* typePrefix, const char* width,
                                           bool lead) const {
    StringBase type(typePrefix);
    type += "_";
    type += width;
    type += lead ? "_LEAD" : "_CHAIN";
    type.MakeUpper();
    const auto found = m_multibootTypes.find(type);
    return found != m_multibootTypes.end() && holdsIgnoringCase(found->second, device);
}

void ConstraintsManager::dumpMbBpiSpi() const {
    using reporting::message;
    using reporting::location::DUMP;
    for (const auto& [type, devices] : m_multibootTypes) {
        message(DUMP).issueStatus("%s:", type.c_str());
        for (const StringBase& device : devices) {
            message(DUMP).issueStatus(" %s", device.c_str());
        }
        message(DUMP).issueStatus("\n");
    }
}
