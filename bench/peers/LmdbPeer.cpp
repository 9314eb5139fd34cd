#include "peers/LmdbPeer.h"

#include <cstring>
#include <filesystem>
#include <stdexcept>

namespace bench {

namespace {

constexpr std::size_t MAP_SIZE = std::size_t{1} << 30;

/// Both tables of a family, in one value.
using FamilyMasks = std::array<Masks, 2>;

void require(int result) {
    if (result != MDB_SUCCESS) {
        throw std::runtime_error(mdb_strerror(result));
    }
}

// LMDB takes what it only reads through a pointer to what may be written.
[[nodiscard]] MDB_val asValue(std::string_view text) noexcept {
    return {text.size(), const_cast<char*>(text.data())};
}

template <typename Object>
[[nodiscard]] MDB_val asBytes(Object& object) noexcept {
    return {sizeof(object), &object};
}

[[nodiscard]] MDB_val find(MDB_txn& transaction, MDB_dbi table, MDB_val key) {
    MDB_val value;
    require(mdb_get(&transaction, table, &key, &value));
    return value;
}

} // namespace

LmdbPeer::LmdbPeer(const Facts& facts, const std::string& directory) {
    const std::string path = directory + "/facts.lmdb";
    std::filesystem::remove(path);
    MDB_env* environment = nullptr;
    require(mdb_env_create(&environment));
    m_environment.reset(environment);
    require(mdb_env_set_mapsize(environment, MAP_SIZE));
    require(mdb_env_set_maxdbs(environment, 3));
    require(mdb_env_open(environment, path.c_str(), MDB_NOSUBDIR | MDB_NOLOCK | MDB_NOSYNC | MDB_NORDAHEAD,
                         0600));
    fill(facts);
    MDB_txn* transaction = nullptr;
    require(mdb_txn_begin(environment, nullptr, MDB_RDONLY, &transaction));
    m_transaction.reset(transaction);
}

void LmdbPeer::fill(const Facts& facts) {
    MDB_txn* transaction = nullptr;
    require(mdb_txn_begin(m_environment.get(), nullptr, 0, &transaction));
    require(mdb_dbi_open(transaction, "devices", MDB_CREATE, &m_devices));
    require(mdb_dbi_open(transaction, "families", MDB_CREATE | MDB_INTEGERKEY, &m_families));
    require(mdb_dbi_open(transaction, "properties", MDB_CREATE, &m_properties));
    const auto put = [transaction](MDB_dbi table, MDB_val key, MDB_val value) {
        require(mdb_put(transaction, table, &key, &value, 0));
    };
    unsigned number = 0;
    for (const Family& family : facts.families) {
        FamilyMasks masks{family.operations, family.options};
        put(m_families, asBytes(number), asBytes(masks));
        for (const Device& device : family.devices) {
            put(m_devices, asValue(device.name), asBytes(number));
            for (const Property& property : device.properties) {
                put(m_properties, asValue(device.name + "_" + property.key), asValue(property.value));
            }
        }
        ++number;
    }
    require(mdb_txn_commit(transaction));
}

std::uint32_t LmdbPeer::mask(const Question& question, std::size_t table) const {
    const MDB_val family = find(*m_transaction, m_devices, asValue(question.device));
    const MDB_val masks = find(*m_transaction, m_families, family);
    const std::size_t place = table * std::tuple_size_v<Masks> + cellOf(question.mode, question.output);
    std::uint32_t mask = 0;
    std::memcpy(&mask, static_cast<const char*>(masks.mv_data) + place * sizeof(mask), sizeof(mask));
    return mask;
}

std::string_view LmdbPeer::property(const Question& question) {
    m_key.assign(question.device).append(1, '_').append(question.key);
    const MDB_val value = find(*m_transaction, m_properties, asValue(m_key));
    return {static_cast<const char*>(value.mv_data), value.mv_size};
}

} // namespace bench
