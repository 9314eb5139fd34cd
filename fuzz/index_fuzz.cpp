// Decodes the index of a directory: as it comes, where the checksum refuses most of what a fuzzer makes up, and with the
// right checksum. Whatever is accepted must be what the writer would have written, and safe to use.
#include "Input.h"

#include "database/DeviceIndex.h"
#include "database/DirectoryIndex.h"

#include <algorithm>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace {

namespace format = acd::indexFormat;

/// The contents with the checksum that belongs to them.
std::string sealed(std::string contents) {
    format::Writer checksum;
    checksum.number(format::checksum(contents));
    return contents + checksum.bytes();
}

/// Uses everything that an index says, as the look-up of devices does.
void use(const acd::DirectoryIndex& index) {
    acd::DeviceIndex devices;
    for (const acd::IndexedFile& file : index.contents().files) {
        devices.add(file.sections, 0);
    }
    for (const acd::IndexedFile& file : index.contents().files) {
        file.sections.forEach([&devices](std::string_view name) {
            if (devices.family(name) != 0) {
                fuzz::fail("a section is not found");
            }
        });
        const acd::PackedStrings* const sections = index.sections(file.name);
        if (sections != nullptr && !index.contents().isSettled(file)) {
            // Names may repeat here; the directory's listing, which has none twice, is compared before.
            const auto same = [&](const acd::IndexedFile& other) {
                return other.name == file.name && index.contents().isSettled(other);
            };
            if (std::ranges::none_of(index.contents().files, same)) {
                fuzz::fail("a file that may have changed is not read");
            }
        }
    }
    std::vector<std::string_view> names;
    for (const acd::IndexedFile& file : index.contents().files) {
        names.push_back(file.name);
    }
    if (!names.empty() && index.isCurrent("/nowhere", names)) {
        fuzz::fail("a directory that does not exist has an index that is current");
    }
}

void decode(const std::string& bytes) {
    acd::MemorySource source(bytes);
    if (const std::optional<acd::DirectoryIndex> index = acd::DirectoryIndex::decode(acd::readAll(source))) {
        fuzz::expectSame("what is written again", bytes, format::encode(index->contents()));
        use(*index);
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string bytes(fuzz::Input(data, size).rest());
    decode(bytes);
    decode(sealed(bytes));
    decode(sealed(std::string(format::SIGNATURE) + bytes));
    return 0;
}
