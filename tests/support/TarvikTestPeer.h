#pragma once

#include <tarvik/ConstraintsManager.h>

#include <AcdStore.h>
#include <Port_MsgManData.h>

/// Reaches the manager's members, and puts manager, databases and sink back to the state in which a process starts.
class TarvikTestPeer {
public:
    /// The members, by the manager's own names. Tests that use them include `Implementation.h`.
    using Members = ConstraintsManager::Implementation;

    static Members& members(const ConstraintsManager& manager) { return *manager.m_implementation; }

    /// Removes the manager, if there is one, so that the next request for it makes a new one.
    static void removeManager() {
        if (ConstraintsManager::s_instance != nullptr) {
            ConstraintsManager::RemoveConstraintsManager();
            forgetManager();
        }
    }

    /// The same for a manager that is removed already.
    static void forgetManager() { ConstraintsManager::s_instance = nullptr; }

    static void reset() {
        removeManager();
        AcdStore::resetForTesting();
        Port_MsgManData::setSink({});
    }

    /// The pointer as it is; after a removal it must not be followed.
    static ConstraintsManager* instance() { return ConstraintsManager::s_instance; }
};
