#pragma once

#include "StringBase.h"

#include <tarvik/Attributes.h>

/// Records text for smoke tests, such as the dumps of the constraints manager.
///
/// Pieces are joined as they come, nothing is put between them.
class TARVIK_HOST_API TarvikSmokeMgr {
public:
    /// Records a finished piece.
    /// @param piece safe for any content: `%%` gives `%`, any other `%` stays as it is
    void smokeStatus(const char* piece);

    /// Records what printf would print. A null text formats as `(null)`. A template only so that overload
    /// resolution prefers the finished piece where there are no further arguments.
    /// @param format as of printf, as are the arguments after it
    template <typename Formatted = void>
    TARVIK_PRINTF(2, 3)
    void smokeStatus(const char* format, ...);

    /// @return all that was recorded so far; valid until the next piece
    [[nodiscard]] const StringBase& text() const noexcept { return m_text; }

private:
    StringBase m_text;
};
