#include "peers/HwdbPeer.h"

#include <charconv>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace bench {

namespace {

constexpr const char* DEVICE = "tarvik-device:";
constexpr const char* FAMILY = "tarvik-family:";

void writeMasks(std::ofstream& text, char table, const Masks& masks) {
    for (std::size_t cell = 0; cell < masks.size(); ++cell) {
        text << ' ' << table << cell << '=' << masks[cell] << '\n';
    }
}

void write(const Facts& facts, const std::filesystem::path& path) {
    std::ofstream text(path);
    std::size_t number = 0;
    for (const Family& family : facts.families) {
        text << FAMILY << number << '\n';
        writeMasks(text, 'O', family.operations);
        writeMasks(text, 'P', family.options);
        text << '\n';
        for (const Device& device : family.devices) {
            text << DEVICE << device.name << "\n FAMILY=" << number << '\n';
            for (const Property& property : device.properties) {
                text << ' ' << property.key << '=' << property.value << '\n';
            }
            text << '\n';
        }
        ++number;
    }
}

} // namespace

HwdbPeer::HwdbPeer(const Facts& facts, const std::string& directory) {
    const std::filesystem::path root = std::filesystem::absolute(directory) / "hwdb";
    std::filesystem::create_directories(root / "etc/udev/hwdb.d");
    write(facts, root / "etc/udev/hwdb.d/facts.hwdb");
    if (std::system(("systemd-hwdb --root='" + root.string() + "' update").c_str()) != 0) {
        throw std::runtime_error("systemd-hwdb can't compile the facts");
    }
    sd_hwdb* database = nullptr;
    if (sd_hwdb_new_from_path((root / "etc/udev/hwdb.bin").c_str(), &database) < 0) {
        throw std::runtime_error("can't open what systemd-hwdb compiled");
    }
    m_database.reset(database);
}

std::uint32_t HwdbPeer::mask(const Question& question, char table) {
    m_name.assign(DEVICE).append(question.device);
    const std::string_view family = find(m_name, "FAMILY");
    m_name.assign(FAMILY).append(family);
    m_key.assign(1, table).append(std::to_string(cellOf(question.mode, question.output)));
    const std::string_view text = find(m_name, m_key.c_str());
    std::uint32_t mask = 0;
    std::from_chars(text.data(), text.data() + text.size(), mask);
    return mask;
}

std::string_view HwdbPeer::property(const Question& question) {
    m_name.assign(DEVICE).append(question.device);
    return find(m_name, question.key.c_str());
}

std::string_view HwdbPeer::find(const std::string& name, const char* key) {
    const char* value = nullptr;
    if (sd_hwdb_get(m_database.get(), name.c_str(), key, &value) < 0) {
        throw std::runtime_error("sd-hwdb has no " + name + " " + key);
    }
    return value;
}

} // namespace bench
