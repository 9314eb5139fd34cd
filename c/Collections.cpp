// Sets and maps that the manager returned, read one text at a time.
#include "Boundary.h"

#include <bit>
#include <iterator>
#include <string_view>

using namespace boundary;

namespace {

std::string_view viewOf(const char* text) { return text == nullptr ? std::string_view() : text; }

/// Moves `at` to the next element.
/// @return it; the end if there is none
template <typename Collection>
typename Collection::const_iterator advance(const Collection& collection, tarvik_iterator& at) {
    using Iterator = typename Collection::const_iterator;
    static_assert(sizeof(Iterator) == sizeof at.position && std::is_trivially_copyable_v<Iterator>);
    auto next = collection.begin();
    if (at.position != nullptr) {
        const auto current = std::bit_cast<Iterator>(at.position);
        next = current == collection.end() ? current : std::next(current);
    }
    at.position = std::bit_cast<const void*>(next);
    return next;
}

} // namespace

extern "C" {

std::size_t tarvik_text_set_size(const tarvik_text_set* set) {
    return set == nullptr ? 0 : fromC(set)->size();
}

int tarvik_text_set_contains(const tarvik_text_set* set, const char* text) {
    return set != nullptr && fromC(set)->contains(viewOf(text)) ? 1 : 0;
}

const char* tarvik_text_set_next(const tarvik_text_set* set, tarvik_iterator* at) {
    if (set == nullptr || at == nullptr) {
        return nullptr;
    }
    const auto next = advance(*fromC(set), *at);
    return next == fromC(set)->end() ? nullptr : next->c_str();
}

std::size_t tarvik_text_map_size(const tarvik_text_map* map) {
    return map == nullptr ? 0 : fromC(map)->size();
}

const char* tarvik_text_map_find(const tarvik_text_map* map, const char* key) {
    if (map == nullptr) {
        return nullptr;
    }
    const auto found = fromC(map)->find(viewOf(key));
    return found == fromC(map)->end() ? nullptr : found->second.c_str();
}

const char* tarvik_text_map_next(const tarvik_text_map* map, tarvik_iterator* at, const char** value) {
    if (map == nullptr || at == nullptr) {
        return nullptr;
    }
    const auto next = advance(*fromC(map), *at);
    if (next == fromC(map)->end()) {
        return nullptr;
    }
    if (value != nullptr) {
        *value = next->second.c_str();
    }
    return next->first.c_str();
}

} // extern "C"
