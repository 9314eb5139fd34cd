#pragma once

#include <tarvik/ConstraintsManager.h>

/// Reaches the members of the manager for tests against any host; it knows nothing of the host.
class TarvikTestPeer {
public:
    /// The members, by the manager's own names. Tests that use them include `Implementation.h`.
    using Members = ConstraintsManager::Implementation;

    static const Members& members(const ConstraintsManager& manager) { return *manager.m_implementation; }

    /// Removes the manager, if there is one, so that the next request for it makes a new one.
    static void removeManager() {
        if (exists()) {
            ConstraintsManager::RemoveConstraintsManager();
            ConstraintsManager::s_instance = nullptr;
        }
    }
    [[nodiscard]] static bool exists() { return ConstraintsManager::s_instance != nullptr; }
};
