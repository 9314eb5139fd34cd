#pragma once

/// Whether this program runs under the address sanitizer, which makes memory slow and needs descriptors of its own.
constexpr bool isSanitized() {
#if defined(__SANITIZE_ADDRESS__)
    return true;
#elif defined(__has_feature)
    return __has_feature(address_sanitizer);
#else
    return false;
#endif
}
