#pragma once

#include "peers/Question.h"

#include <memory>
#include <string_view>

#include <systemd/sd-hwdb.h>

namespace bench {

/// The hardware database of systemd: records compiled into a mapped trie. A device's record has its family's number and
/// its properties, a family's the masks of its cells, as texts.
class HwdbPeer {
public:
    static constexpr const char* NAME = "sd-hwdb";
    static constexpr std::size_t QUESTIONS =
        500; ///< a round: one takes hundreds of times as long as elsewhere

    HwdbPeer(const Facts& facts, const std::string& directory);

    [[nodiscard]] std::uint32_t operations(const Question& question) { return mask(question, 'O'); }
    [[nodiscard]] std::uint32_t options(const Question& question) { return mask(question, 'P'); }
    [[nodiscard]] bool allows(const Question& question) {
        return (operations(question) >> question.operation & 1U) != 0;
    }

    /// Valid until the next question.
    [[nodiscard]] std::string_view property(const Question& question);

private:
    struct Closer {
        void operator()(sd_hwdb* database) const noexcept { sd_hwdb_unref(database); }
    };

    [[nodiscard]] std::uint32_t mask(const Question& question, char table);
    [[nodiscard]] std::string_view find(const std::string& name, const char* key);

    std::unique_ptr<sd_hwdb, Closer> m_database;
    std::string m_name; ///< of what is asked for; its memory is used again
    std::string m_key;
};

} // namespace bench
