#include "peers/JsonPeers.h"

#include "peers/JsonText.h"

namespace bench {

JsonPeer::JsonPeer(const Facts& facts) : m_document(nlohmann::json::parse(wholeDocument(facts))) {}

std::uint32_t JsonPeer::mask(const Question& question, const char* table) const {
    const auto& family = m_document["devices"][question.device]["family"].get_ref<const std::string&>();
    return m_document["families"][family][table][cellOf(question.mode, question.output)].get<std::uint32_t>();
}

std::string_view JsonPeer::property(const Question& question) const {
    return m_document["devices"][question.device]["properties"][question.key].get_ref<const std::string&>();
}

OnDemandPeer::OnDemandPeer(const Facts& facts) {
    for (const Family& family : facts.families) {
        m_families.emplace(family.name, familyDocument(family));
        for (const Device& device : family.devices) {
            m_devices.emplace(device.name, deviceDocument(family, device));
        }
    }
}

std::uint32_t OnDemandPeer::mask(const Question& question, const char* table) {
    simdjson::ondemand::document device = m_parser.iterate(m_devices.find(question.device)->second);
    const std::string_view name = device["family"];
    m_family = name;
    simdjson::ondemand::document family = m_parser.iterate(m_families.find(m_family)->second);
    const std::uint64_t mask = family[table].get_array().at(cellOf(question.mode, question.output));
    return static_cast<std::uint32_t>(mask);
}

std::string_view OnDemandPeer::property(const Question& question) {
    simdjson::ondemand::document device = m_parser.iterate(m_devices.find(question.device)->second);
    return device["properties"][question.key];
}

} // namespace bench
