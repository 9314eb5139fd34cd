// The dumps, into a text that the library keeps or to the status channel.
#include "Boundary.h"

#include <TarvikSmokeMgr.h>

#include <utility>

using namespace boundary;

namespace {

using Dump = void (ConstraintsManager::*)(TarvikSmokeMgr*);

tarvik_status dump(Dump method, const char** table) noexcept {
    static TarvikSmokeMgr latest;
    return guard([&] {
        ConstraintsManager& dumped = manager();
        if (table == nullptr) {
            (dumped.*method)(nullptr);
            return;
        }
        TarvikSmokeMgr recorder;
        (dumped.*method)(&recorder);
        latest = std::move(recorder);
        *table = latest.text().c_str();
    });
}

} // namespace

extern "C" {

tarvik_status tarvik_dump_operations_table(const char** table) {
    return dump(&ConstraintsManager::dumpOperationsTable, table);
}

tarvik_status tarvik_dump_bsdl_operations_table(const char** table) {
    return dump(&ConstraintsManager::dumpBsdlOperationsTable, table);
}

tarvik_status tarvik_dump_program_options_table(const char** table) {
    return dump(&ConstraintsManager::dumpProgramOptionsTable, table);
}

tarvik_status tarvik_dump_cached_device_families(const char** table) {
    return dump(&ConstraintsManager::dumpCachedDeviceFamilies, table);
}

tarvik_status tarvik_dump_mb_bpi_spi() {
    return guard([] { manager().dumpMbBpiSpi(); });
}

} // extern "C"
