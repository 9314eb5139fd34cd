#pragma once

#include <StringBase.h>

/// The family that was resolved last. Repeated questions refer to a name that is kept elsewhere: copying it would be a
/// sixth of their work.
class LatestFamily {
public:
    /// Copies a name.
    LatestFamily& operator=(const StringBase& name) {
        m_copy = name;
        m_kept = nullptr;
        return *this;
    }

    /// Refers to a name.
    /// @param name has to outlive this
    void refer(const StringBase& name) noexcept { m_kept = &name; }

    /// @return the name; valid until the next change
    [[nodiscard]] const StringBase& get() const noexcept { return m_kept == nullptr ? m_copy : *m_kept; }

private:
    StringBase m_copy;
    const StringBase* m_kept = nullptr;
};
