#pragma once

#include "database/LittleEndian.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace acd {

/// Names, stored one after the other in one block of memory. Copies share the block, which never changes.
///
/// Each name follows its length, a number of 32 bits with the lowest byte first: the index of a directory contains
/// names in the same form, so that they are used where they were read to.
class PackedStrings {
public:
    /// No names.
    PackedStrings() = default;

    /// Takes names that are packed already.
    /// @param owner keeps the bytes
    /// @return nothing if the bytes are not names with their lengths, none of them empty
    [[nodiscard]] static std::optional<PackedStrings> from(std::shared_ptr<const char[]> owner,
                                                           std::string_view bytes) noexcept;

    /// Calls `action` for each name, in order.
    template <typename Action>
    void forEach(Action action) const {
        for (std::string_view rest = m_bytes; !rest.empty();) {
            action(takeName(rest));
        }
    }

    /// Whether a name is among them, without regard to ASCII case.
    [[nodiscard]] bool containsIgnoreCase(std::string_view name) const noexcept;

    /// How many there are, counted each time.
    [[nodiscard]] std::size_t count() const noexcept;

    [[nodiscard]] std::string_view bytes() const noexcept { return m_bytes; }

private:
    friend class StringPacker;

    using Length = std::uint32_t;

    PackedStrings(std::shared_ptr<const char[]> owner, std::string_view bytes) noexcept
        : m_owner(std::move(owner)), m_bytes(bytes) {}

    /// Takes the first name off the bytes.
    [[nodiscard]] static std::string_view takeName(std::string_view& bytes) noexcept {
        const std::string_view name(bytes.data() + sizeof(Length), loadLittleEndian<Length>(bytes.data()));
        bytes.remove_prefix(sizeof(Length) + name.size());
        return name;
    }

    std::shared_ptr<const char[]> m_owner;
    std::string_view m_bytes;
};

/// Packs names.
class StringPacker {
public:
    /// @param name not empty
    void add(std::string_view name);

    /// Forgets all names, and keeps the memory for the next ones.
    void clear() noexcept { m_bytes.clear(); }

    /// The names that were added.
    [[nodiscard]] PackedStrings pack() const;

private:
    std::string m_bytes;
};

} // namespace acd
