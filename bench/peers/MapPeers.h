#pragma once

#include "peers/Question.h"

#include <map>
#include <string_view>
#include <unordered_map>

namespace bench {

/// What an application writes that keeps the facts itself: a map from device to its family's masks, and a flat
/// one from "device_key" to the property's value.
template <typename Families, typename Properties>
class MapPeer {
public:
    explicit MapPeer(const Facts& facts) {
        for (const Family& family : facts.families) {
            for (const Device& device : family.devices) {
                m_families.emplace(device.name, &family);
                for (const Property& property : device.properties) {
                    m_properties.emplace(device.name + "_" + property.key, property.value);
                }
            }
        }
    }

    [[nodiscard]] std::uint32_t operations(const Question& question) const {
        return m_families.find(question.device)->second->operations[cellOf(question.mode, question.output)];
    }
    [[nodiscard]] std::uint32_t options(const Question& question) const {
        return m_families.find(question.device)->second->options[cellOf(question.mode, question.output)];
    }
    [[nodiscard]] bool allows(const Question& question) const {
        return (operations(question) >> question.operation & 1U) != 0;
    }
    /// The key is joined in memory that is used again: nobody who asks has it joined already.
    [[nodiscard]] std::string_view property(const Question& question) {
        m_key.assign(question.device).append(1, '_').append(question.key);
        return m_properties.find(m_key)->second;
    }

private:
    Families m_families;
    Properties m_properties;
    std::string m_key;
};

struct OrderedMapPeer : MapPeer<std::map<std::string, const Family*>, std::map<std::string, std::string>> {
    static constexpr const char* NAME = "std::map";
    using MapPeer::MapPeer;
};

struct HashMapPeer
    : MapPeer<std::unordered_map<std::string, const Family*>, std::unordered_map<std::string, std::string>> {
    static constexpr const char* NAME = "std::unordered_map";
    using MapPeer::MapPeer;
};

} // namespace bench
