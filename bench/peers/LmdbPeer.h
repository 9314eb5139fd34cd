#pragma once

#include "peers/Question.h"

#include <memory>
#include <string_view>

#include <lmdb.h>

namespace bench {

/// LMDB: a memory-mapped file without locks, one read transaction for all questions. A device leads to its family's
/// number, that to the masks; "device_key" leads to a property's value.
class LmdbPeer {
public:
    static constexpr const char* NAME = "LMDB";

    LmdbPeer(const Facts& facts, const std::string& directory);

    [[nodiscard]] std::uint32_t operations(const Question& question) const { return mask(question, 0); }
    [[nodiscard]] std::uint32_t options(const Question& question) const { return mask(question, 1); }
    [[nodiscard]] bool allows(const Question& question) const {
        return (operations(question) >> question.operation & 1U) != 0;
    }
    [[nodiscard]] std::string_view property(const Question& question);

private:
    struct Closer {
        void operator()(MDB_env* environment) const noexcept { mdb_env_close(environment); }
        void operator()(MDB_txn* transaction) const noexcept { mdb_txn_abort(transaction); }
    };

    void fill(const Facts& facts);
    [[nodiscard]] std::uint32_t mask(const Question& question, std::size_t table) const;

    std::unique_ptr<MDB_env, Closer> m_environment;
    std::unique_ptr<MDB_txn, Closer> m_transaction;
    MDB_dbi m_devices = 0;
    MDB_dbi m_families = 0;
    MDB_dbi m_properties = 0;
    std::string m_key; ///< of a property; its memory is used again
};

} // namespace bench
