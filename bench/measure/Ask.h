#pragma once

#include "peers/Question.h"

#include <cstdint>
#include <string_view>

// The four kinds of questions, each reduced to a number that the next one can be made to wait for.

namespace bench {

struct AskOperations {
    static constexpr const char* NAME = "operations";
    template <typename Peer>
    [[nodiscard]] static std::uint64_t ask(Peer& peer, const Question& question) {
        return peer.operations(question);
    }
};

struct AskOptions {
    static constexpr const char* NAME = "options";
    template <typename Peer>
    [[nodiscard]] static std::uint64_t ask(Peer& peer, const Question& question) {
        return peer.options(question);
    }
};

struct AskAllows {
    static constexpr const char* NAME = "check";
    template <typename Peer>
    [[nodiscard]] static std::uint64_t ask(Peer& peer, const Question& question) {
        return peer.allows(question) ? 1 : 0;
    }
};

struct AskProperty {
    static constexpr const char* NAME = "property";
    template <typename Peer>
    [[nodiscard]] static std::uint64_t ask(Peer& peer, const Question& question) {
        const std::string_view text = peer.property(question);
        return text.size() * 256 + static_cast<unsigned char>(text.front());
    }
};

} // namespace bench
