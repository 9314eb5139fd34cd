#pragma once

#include "model/Records.h"

#include <AcdStore.h>

#include <functional>
#include <optional>
#include <string>
#include <vector>

/// What was read from the database while some work was done, in the order of the reads.
class ReadLog {
public:
    /// A text that was read, and where it is written.
    struct Text {
        std::string text;
        AcdStore::SourceLocation location;
    };

    /// A field that was asked for.
    struct Field {
        int number;
        std::optional<Text> text; ///< nothing: the field does not exist
    };

    /// A record or an item of a list, as far as it was read.
    struct Item {
        int index;
        Text whole;
        std::vector<Field> fields{}; ///< by their numbers

        /// A field that was read; null when it was not, or does not exist.
        [[nodiscard]] const Text* field(int number) const;
    };

    /// Reads of one key of one accessor, one after the other. A key that does not exist has no items.
    struct Value {
        std::string family; ///< as its file spells it; empty: the accessor of an empty database
        std::string device; ///< as its section spells it; empty: the accessor of the family itself
        std::string key;
        bool fromSection = false; ///< whether the device's own section has the key
        std::vector<Item> items{};

        /// An item that was read; null when it was not, or does not exist.
        [[nodiscard]] const Item* item(int index) const;

        /// The name that opens the same accessor.
        [[nodiscard]] std::string accessorName() const;

        /// The values of lower layers that this one replaces.
        [[nodiscard]] catalogue::Shadows shadows() const;
    };

    /// A text that was found in the log, and the value that contains it.
    struct Match {
        const Value* value = nullptr;
        const Text* text = nullptr;

        [[nodiscard]] catalogue::SourceText sourceText() const;

        explicit operator bool() const noexcept { return text != nullptr; }
    };

    /// Does some work and logs what it reads, also when it throws.
    void record(const std::function<void()>& work);

    [[nodiscard]] const std::vector<Value>& values() const noexcept { return m_values; }

    /// The first value of a key that was read; null when the key was not asked for.
    [[nodiscard]] const Value* find(const std::string& key) const;

    /// The value of a key of which this item was read; null when there is no such item.
    [[nodiscard]] const Value* findWithItem(const std::string& key, int index) const;

    /// The first item of a list that is this text.
    [[nodiscard]] Match findItem(const std::string& key, const std::string& text) const;

    /// The text that was read last; no match when the last read found nothing.
    [[nodiscard]] Match last() const;

    /// The text that was read last or, if its field was missing, the record that lacks it.
    [[nodiscard]] Match lastOrItsRecord() const;

private:
    void add(const AcdStore::Read& read);

    std::vector<Value> m_values;
    const Text* m_last = nullptr;
    const Text* m_lastRecord = nullptr;
};
