#pragma once

#include "support/Fixtures.h"

#include "database/Store.h"

#include <AcdReader.h>
#include <AcdStore.h>
#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <TarvikException.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

/// A directory of its own for one test, gone with all that is in it at the end.
class TemporaryDirectory {
public:
    TemporaryDirectory() {
        std::string name = (std::filesystem::temp_directory_path() / "tarvik-XXXXXX").generic_string();
        if (mkdtemp(name.data()) == nullptr) {
            throw std::runtime_error("no temporary directory");
        }
        m_path = name;
    }
    ~TemporaryDirectory() {
        std::error_code error;
        std::filesystem::remove_all(m_path, error);
    }
    TemporaryDirectory(const TemporaryDirectory&) = delete;
    TemporaryDirectory& operator=(const TemporaryDirectory&) = delete;

    /// The path of an entry; of the directory itself without a name.
    [[nodiscard]] std::string path(const std::string& name = {}) const {
        return (name.empty() ? m_path : m_path / name).generic_string();
    }

    void write(const std::string& name, std::string_view text) const {
        std::filesystem::create_directories((m_path / name).parent_path());
        std::ofstream(m_path / name, std::ios::binary)
            .write(text.data(), static_cast<std::streamsize>(text.size()));
    }

private:
    std::filesystem::path m_path;
};

/// Starts each test with a store that knows nothing yet, and takes all messages.
class DatabaseTest : public testing::Test {
protected:
    DatabaseTest() { acd::Store::resetForTesting(); }

    MessageRecorder messages;
};

/// Starts again with these files.
inline void useFiles(std::map<std::string, std::string> files) {
    acd::Store::resetForTesting();
    AcdStore::setMemoryFiles(std::move(files));
}

/// Starts again with these directories.
inline void useDirectories(std::vector<std::string> directories) {
    acd::Store::resetForTesting();
    AcdStore::setSearchPath(std::move(directories));
}

/// The whole value of a key as an accessor opened by `name` gives it.
[[nodiscard]] inline std::optional<std::string> valueOf(const char* name, const char* key) {
    const char* const text = AcdReader(name).getDevkey()->getstringbykey(key, nullptr, 0, nullptr, 0);
    return text == nullptr ? std::nullopt : std::optional<std::string>(text);
}

/// The whole value of a key of the family "kestrel" whose file holds `text`, and nothing else there is.
[[nodiscard]] inline std::optional<std::string> valueIn(std::string_view text, const char* key,
                                                        const char* name = "kestrel") {
    useFiles({{"kestrel.acd", std::string(text)}});
    return valueOf(name, key);
}

/// The devices of the family "kestrel" whose file holds `text`.
[[nodiscard]] inline std::vector<std::string> devicesIn(std::string_view text) {
    useFiles({{"kestrel.acd", std::string(text)}});
    return AcdStore::devices("kestrel");
}

/// The family that a name resolves to.
[[nodiscard]] inline std::optional<std::string> familyOf(const char* name) {
    const PicConfig configuration(name, 1, PM_PARTNAME_BINDING::BY_NAME);
    return configuration.get_pm() == nullptr ? std::nullopt
                                             : std::optional<std::string>(configuration.get_pm());
}

/// All items of a list, as the manager reads them: up to the first that is not there.
[[nodiscard]] inline std::vector<std::string> itemsOf(PM_DEVKEY& accessor, const char* key,
                                                      const char* separator) {
    std::vector<std::string> items;
    for (int index = 0; index <= 32767; ++index) {
        const char* const item =
            accessor.getstringbykey(key, separator, static_cast<short>(index), nullptr, 0);
        if (item == nullptr) {
            break;
        }
        items.emplace_back(item);
    }
    return items;
}
