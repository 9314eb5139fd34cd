#include <PicConfig.h>

#include "database/Store.h"
#include "text/NullToEmpty.h"

// Finds the family of a part. Its database stays closed: a part's family is often asked for when nothing else
// is.

namespace {

[[nodiscard]] const char* moduleOf(const char* name) {
    const acd::Family* const family = acd::Store::instance().resolve(nullToEmpty(name)).family;
    return family == nullptr ? nullptr : family->name.c_str();
}

} // namespace

PicConfig::PicConfig(const char* name, int, PM_PARTNAME_BINDING) : PM_PIC(moduleOf(name)) {}
