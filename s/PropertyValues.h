#pragma once

#include <tarvik/ltptstr.h>

#include <cstddef>
#include <cstdint>
#include <memory>
#include <set>
#include <string_view>
#include <utility>

/// The values of one property, and their owner. Nearly all properties have one value, and nearly always only its text is
/// asked for, so its set is made when a question needs it.
class PropertyValues {
public:
    /// Texts, each once, in byte order.
    using TextSet = std::set<StringBase, ltptstr>;

    /// The owner of a property: the length of its name (the table has its text), and whether it is a flash.
    struct Owner {
        std::uint32_t length; ///< of the owner's name, in bytes
        bool isFlash;         ///< is the owner an SPI flash?
    };

    /// With one value.
    /// @param value the value
    /// @param owner the owner of the property
    PropertyValues(StringBase value, Owner owner) : m_owner(owner), m_first(std::move(value)) {}

    /// With any number of values.
    /// @param values the values
    /// @param owner the owner of the property
    PropertyValues(TextSet values, Owner owner)
        : m_owner(owner), m_set(std::make_unique<TextSet>(std::move(values))) {
        if (!m_set->empty()) {
            m_first = *m_set->begin();
        }
    }

    /// @return the owner of the property
    [[nodiscard]] const Owner& owner() const noexcept { return m_owner; }

    /// @return whether there is no value
    [[nodiscard]] bool empty() const noexcept { return m_set != nullptr && m_set->empty(); }

    /// @return the first value in byte order, of one at least
    [[nodiscard]] const StringBase& first() const noexcept { return m_first; }

    /// @param value compared byte by byte
    /// @return whether it is among the values
    [[nodiscard]] bool contains(std::string_view value) const noexcept {
        return m_set != nullptr ? m_set->find(value) != m_set->end() : ltptstr::view(m_first) == value;
    }

    /// @return all of them; valid as long as this object
    [[nodiscard]] const TextSet& set() const {
        if (m_set == nullptr) {
            m_set = std::make_unique<TextSet>(TextSet{m_first});
        }
        return *m_set;
    }

    /// @return the first value in byte order
    [[nodiscard]] auto begin() const { return set().begin(); }

    /// @return the end
    [[nodiscard]] auto end() const { return set().end(); }

private:
    Owner m_owner;
    StringBase m_first;
    mutable std::unique_ptr<TextSet> m_set; ///< null until a question needs it
};
