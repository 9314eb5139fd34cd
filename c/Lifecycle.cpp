// Where the data comes from, and how the manager comes and goes.
#include "Boundary.h"

#include <AcdStore.h>

#include <map>
#include <string>
#include <utility>
#include <vector>

using namespace boundary;

namespace {

void requireNotStarted() {
    requireOutsideOfCallback();
    if (session.started || session.removed) {
        throw Refusal{TARVIK_TOO_LATE, "the manager has been made: set where databases are before"};
    }
}

template <typename Value>
void requireArray(const Value* values, std::size_t count) {
    if (count != 0) {
        require(values, "a count has no array");
    }
}

std::string textOf(const char* text) { return text == nullptr ? "" : text; }

template <typename Value>
void copyOrders(const std::vector<Value>& orders, int* values, std::size_t capacity, std::size_t* count) {
    require(count);
    requireArray(values, capacity);
    for (std::size_t at = 0; at < orders.size() && at < capacity; ++at) {
        values[at] = static_cast<int>(orders[at]);
    }
    *count = orders.size();
}

} // namespace

extern "C" {

const char* tarvik_version() { return TARVIK_VERSION; }

tarvik_status tarvik_set_search_path(const char* const* directories, std::size_t count) {
    return guard([&] {
        requireArray(directories, count);
        requireNotStarted();
        std::vector<std::string> searchPath;
        for (std::size_t at = 0; at < count; ++at) {
            searchPath.push_back(textOf(directories[at]));
        }
        AcdStore::setSearchPath(std::move(searchPath));
    });
}

tarvik_status tarvik_set_memory_files(const tarvik_memory_file* files, std::size_t count) {
    return guard([&] {
        requireArray(files, count);
        requireNotStarted();
        std::map<std::string, std::string> texts;
        for (std::size_t at = 0; at < count; ++at) {
            const tarvik_memory_file& file = files[at];
            requireArray(file.text, file.length);
            std::string& text = texts[textOf(file.name)];
            text = file.length == 0 ? std::string() : std::string(file.text, file.length);
        }
        AcdStore::setMemoryFiles(std::move(texts));
    });
}

tarvik_status tarvik_get_constraints_manager() {
    return guard([] { static_cast<void>(manager()); });
}

tarvik_status tarvik_remove_constraints_manager() {
    return guard([] {
        requireOutsideOfCallback();
        if (session.removed) {
            throw Refusal{TARVIK_REMOVED, "the manager was removed"};
        }
        session.removed = true;
        ConstraintsManager::RemoveConstraintsManager();
    });
}

tarvik_status tarvik_set_exceptions(int exceptions) {
    return guard([=] { manager().setExceptions(exceptions != 0); });
}

tarvik_status tarvik_get_operation_orders(int* values, std::size_t capacity, std::size_t* count) {
    return guard([&] { copyOrders(manager().getOperationOrders(), values, capacity, count); });
}

tarvik_status tarvik_get_program_option_orders(int* values, std::size_t capacity, std::size_t* count) {
    return guard([&] { copyOrders(manager().getProgramOptionOrders(), values, capacity, count); });
}

} // extern "C"
