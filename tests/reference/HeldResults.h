#pragma once

#include "Outcome.h"

#include <tarvik/ConstraintsManager.h>

#include <functional>
#include <string>
#include <vector>

namespace reference {

/// What the manager returned by reference or pointer, with what it was at that time.
class HeldResults {
public:
    template <typename Result>
    const Result& hold(const Result& result) {
        m_results.push_back({show(result), [&result] { return show(result); }});
        return result;
    }

    const ConstraintsManager::TextSet& hold(const ConstraintsManager::TextSet& set) {
        if (!set.empty()) {
            m_texts.push_back(set.begin()->c_str());
        }
        return hold<ConstraintsManager::TextSet>(set);
    }

    const char* hold(const char* text) {
        if (text != nullptr) {
            m_texts.push_back(text);
            m_results.push_back({show(text), [text] { return show(text); }});
        }
        return text;
    }

    /// A held text; the empty one while none is held.
    [[nodiscard]] const char* text(std::size_t number) const {
        return m_texts.empty() ? "" : m_texts[number % m_texts.size()];
    }

    /// Which result is no longer what it was; empty when none has changed.
    [[nodiscard]] std::string difference() const {
        for (const Result& result : m_results) {
            const std::string now = result.now();
            if (now != result.then) {
                return "a held result changed from " + result.then + " to " + now + "\n";
            }
        }
        return "";
    }

private:
    struct Result {
        std::string then;
        std::function<std::string()> now;
    };
    std::vector<Result> m_results;
    std::vector<const char*> m_texts;
};

} // namespace reference
