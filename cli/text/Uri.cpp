// Paths as URIs, and back: a path may hold any byte, a URI only few.
#include "text/Uri.h"

#include "platform/Platform.h"

#include <AcdText.h>

#include <fmt/format.h>

#include <filesystem>

namespace {

int hexDigit(char byte) {
    const char upper = AcdText::toUpper(byte);
    return upper >= '0' && upper <= '9' ? upper - '0' : upper >= 'A' && upper <= 'F' ? upper - 'A' + 10 : -1;
}

std::string decoded(std::string_view text) {
    std::string result;
    for (std::size_t i = 0; i < text.size(); ++i) {
        const bool isEscape =
            text[i] == '%' && i + 2 < text.size() && hexDigit(text[i + 1]) >= 0 && hexDigit(text[i + 2]) >= 0;
        if (isEscape) {
            result += static_cast<char>(hexDigit(text[i + 1]) * 16 + hexDigit(text[i + 2]));
            i += 2;
        } else {
            result += text[i];
        }
    }
    return result;
}

} // namespace

std::string asUri(std::string_view path) {
    constexpr std::string_view PLAIN = "-._~/";
    std::string uri = !acd::platform::isAbsolute(path) ? "" : path.starts_with('/') ? "file://" : "file:///";
    for (const char given : path) {
        const char byte = acd::platform::pathSeparators().find(given) != path.npos ? '/' : given;
        const bool isLetterOrDigit =
            (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') || (byte >= '0' && byte <= '9');
        if (isLetterOrDigit || PLAIN.find(byte) != PLAIN.npos) {
            uri += byte;
        } else {
            uri += fmt::format("%{:02X}", static_cast<unsigned char>(byte));
        }
    }
    return uri;
}

std::string pathOf(std::string_view uri) {
    constexpr std::string_view SCHEME = "file://";
    if (!uri.starts_with(SCHEME)) {
        return {};
    }
    uri.remove_prefix(SCHEME.size());
    const std::size_t slash = uri.find('/');
    if (slash == uri.npos || (slash != 0 && uri.substr(0, slash) != "localhost")) {
        return {};
    }
    std::string path = decoded(uri.substr(slash));
    // A slash comes before the letter of a drive.
    path.erase(0, acd::platform::isAbsolute(std::string_view(path).substr(1)) ? 1 : 0);
    return acd::fromPath(acd::toPath(path).lexically_normal());
}
