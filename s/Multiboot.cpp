#include "Diagnostics.h"
#include "Implementation.h"
#include "JoinedText.h"
#include "RecordReader.h"
#include "SpiClasses.h"
#include "StringViews.h"

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

void ConstraintsManager::Implementation::readMultibootTypes(PM_DEVKEY* accessor) {
    for (const char* const type : TYPES) {
        m_multibootTypes[type] = readList(*accessor, type);
    }
}

bool ConstraintsManager::Implementation::isMbBpiSpiSupport(const char* device, std::string_view typePrefix,
                                                           std::string_view width, bool lead) const {
    StringBase upperPrefix = toStringBase(typePrefix);
    upperPrefix.MakeUpper();
    StringBase upperWidth = toStringBase(width);
    upperWidth.MakeUpper();
    const JoinedText type{view(upperPrefix), "_", view(upperWidth), lead ? "_LEAD" : "_CHAIN"};
    const auto found = m_multibootTypes.find(type.view());
    return found != m_multibootTypes.end() && containsIgnoreCase(found->second, device);
}

void ConstraintsManager::Implementation::dumpMbBpiSpi() const {
    using diagnostics::message;
    using diagnostics::location::DUMP;
    for (const auto& [type, devices] : m_multibootTypes) {
        message(DUMP).issueStatus("%s:", type.c_str());
        for (const StringBase& device : devices) {
            message(DUMP).issueStatus(" %s", device.c_str());
        }
        message(DUMP).issueStatus("\n");
    }
}
