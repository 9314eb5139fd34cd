#pragma once

#include <algorithm>
#include <string_view>

namespace diff {

/// Orders names as people do: KS50 is before KS100.
struct NaturalLess {
    using is_transparent = void;

    [[nodiscard]] bool operator()(std::string_view left, std::string_view right) const {
        const int order = compare(left, right);
        // Numbers that differ in leading zeros alone.
        return order != 0 ? order < 0 : left < right;
    }

private:
    [[nodiscard]] static int compare(std::string_view left, std::string_view right) {
        while (!left.empty() && !right.empty()) {
            const std::string_view leftPiece = takePiece(left);
            const std::string_view rightPiece = takePiece(right);
            const bool areNumbers = isDigit(leftPiece.front()) && isDigit(rightPiece.front());
            const int order =
                areNumbers ? compareNumbers(leftPiece, rightPiece) : leftPiece.compare(rightPiece);
            if (order != 0) {
                return order;
            }
        }
        return static_cast<int>(right.empty()) - static_cast<int>(left.empty());
    }

    [[nodiscard]] static bool isDigit(char byte) { return byte >= '0' && byte <= '9'; }

    /// Cuts off a number, or one byte.
    [[nodiscard]] static std::string_view takePiece(std::string_view& text) {
        std::size_t length = 1;
        while (isDigit(text.front()) && length < text.size() && isDigit(text[length])) {
            ++length;
        }
        const std::string_view piece = text.substr(0, length);
        text.remove_prefix(length);
        return piece;
    }

    [[nodiscard]] static int compareNumbers(std::string_view left, std::string_view right) {
        for (std::string_view* const number : {&left, &right}) {
            number->remove_prefix(std::min(number->find_first_not_of('0'), number->size()));
        }
        return left.size() != right.size() ? (left.size() < right.size() ? -1 : 1) : left.compare(right);
    }
};

} // namespace diff
