#pragma once

// Further managers in one process, for tools that need answers which do not depend on what was asked before. Only the
// static library has this: applications get the one manager of the process.

#include <tarvik/ConstraintsManager.h>

#include <memory>

/// Makes managers besides the one that `ConstraintsManager::getConstraintsManager` returns, which it never touches.
/// All managers of a process read the same database.
class ManagerFactory {
public:
    /// Destroys a manager that this factory made.
    struct Deleter {
        /// @param manager may be null
        void operator()(ConstraintsManager* manager) const noexcept;
    };

    /// A manager with an owner.
    using Manager = std::unique_ptr<ConstraintsManager, Deleter>;

    /// Makes a manager that was not asked anything yet. As with the process's own manager, a database fault ends the
    /// start-up early and reports itself, and exceptions are on afterwards.
    /// @return the manager, never null
    /// @throw std::bad_alloc when memory runs out
    [[nodiscard]] static Manager make();
};
