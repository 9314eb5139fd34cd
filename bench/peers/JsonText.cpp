#include "peers/JsonText.h"

// The facts as JSON. They hold neither quotes nor control bytes, so nothing needs escaping.

namespace bench {

namespace {

[[nodiscard]] std::string quoted(const std::string& text) { return '"' + text + '"'; }

[[nodiscard]] std::string array(const Masks& masks) {
    std::string text;
    for (const std::uint32_t mask : masks) {
        text += (text.empty() ? "[" : ",") + std::to_string(mask);
    }
    return text + "]";
}

} // namespace

std::string familyDocument(const Family& family) {
    return R"({"operations":)" + array(family.operations) + R"(,"options":)" + array(family.options) + "}";
}

std::string deviceDocument(const Family& family, const Device& device) {
    std::string text = R"({"family":)" + quoted(family.name) + R"(,"properties":)";
    char separator = '{';
    for (const Property& property : device.properties) {
        text += separator + quoted(property.key) + ":" + quoted(property.value);
        separator = ',';
    }
    return text + "}}";
}

std::string wholeDocument(const Facts& facts) {
    std::string families;
    std::string devices;
    for (const Family& family : facts.families) {
        families += (families.empty() ? "" : ",") + quoted(family.name) + ":" + familyDocument(family);
        for (const Device& device : family.devices) {
            devices +=
                (devices.empty() ? "" : ",") + quoted(device.name) + ":" + deviceDocument(family, device);
        }
    }
    return R"({"families":{)" + families + R"(},"devices":{)" + devices + "}}";
}

} // namespace bench
