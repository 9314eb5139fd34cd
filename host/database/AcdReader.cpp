#include <AcdReader.h>

#include "database/Store.h"
#include "text/NullToEmpty.h"

// Readers are thin: a reader finds its database in the store, and leaves it there.

namespace {

/// The module of a name that resolves to nothing.
constexpr const char* NO_MODULE = "base";

} // namespace

AcdReader::AcdReader() {
    acd::Store& store = acd::Store::instance();
    const acd::DatabaseHandle opened = store.openBase();
    m_accessor = &store.accessor(opened);
    m_module = opened.family->name.c_str();
}

AcdReader::AcdReader(const char* name) {
    acd::Store& store = acd::Store::instance();
    const acd::DatabaseHandle opened = store.open(nullToEmpty(name));
    m_accessor = &store.accessor(opened);
    m_module = opened.family == nullptr ? NO_MODULE : opened.family->name.c_str();
}
