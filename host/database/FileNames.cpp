#include "database/FileNames.h"

#include "platform/Platform.h"

#include <AcdText.h>

#include <algorithm>
#include <cstddef>

// How paths, file names and the names of families belong together.

namespace acd {

std::string_view directoryOf(std::string_view path) noexcept {
    const std::size_t slash = path.find_last_of(platform::pathSeparators());
    // The root is named by its slash.
    return slash == path.npos ? std::string_view() : path.substr(0, std::max<std::size_t>(slash, 1));
}

std::string_view fileNameOf(std::string_view path) noexcept {
    return path.substr(path.find_last_of(platform::pathSeparators()) + 1);
}

std::string joinPath(const std::string& directory, const std::string& name) {
    const std::string_view separators = platform::pathSeparators();
    const bool isOpen = directory.find_last_of(separators) + 1 == directory.size();
    return isOpen ? directory + name : directory + separators.front() + name;
}

std::string_view familyName(std::string_view fileName) noexcept {
    constexpr std::string_view EXTENSION = ".acd";
    if (fileName.starts_with('.')) {
        return {}; // a lock or a backup of an editor
    }
    const std::size_t length = fileName.size() - std::min(fileName.size(), EXTENSION.size());
    return AcdText::equalsIgnoreCase(fileName.substr(length), EXTENSION) ? fileName.substr(0, length)
                                                                         : std::string_view();
}

} // namespace acd
