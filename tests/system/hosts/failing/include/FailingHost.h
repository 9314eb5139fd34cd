#pragma once

#include <TarvikException.h>

#include <cstddef>
#include <string>
#include <vector>

/// Which call of the host fails, and how.
namespace failing_host {

enum class Failure {
    TARVIK_EXCEPTION, ///< raises an `InjectedException`
    BAD_ALLOC,        ///< raises std::bad_alloc
};

enum class Extent {
    ONE_CALL,       ///< the calls behind the failed one are served again
    ALL_FROM_THERE, ///< no call is served any more
};

/// A failure of the host, of a type that the manager knows by its base class alone.
class InjectedException : public TarvikException {
public:
    InjectedException() noexcept : TarvikException("Host", "", "", 1) {}
    ~InjectedException() override;

    /// Counts the reports, and says nothing.
    void report() const override;
};

/// Fails at the call of this number, counted from 1 and from now.
void failAt(std::size_t call, Failure failure, Extent extent = Extent::ONE_CALL);

/// Serves every call from now on.
void serve();

/// Did a call fail since `failAt`?
bool hasFailed();

/// How often an `InjectedException` was asked to report itself since `failAt`.
int reports();

/// The closed readers and the reports since `failAt` or `serve`, in order: "close DATABASE", "report".
const std::vector<std::string>& events();

/// The reads of keys since `failAt` or `serve`, as "database key".
const std::vector<std::string>& reads();

} // namespace failing_host
