// The last error of each thread, and how exceptions become statuses.
#include "Boundary.h"

#include <TarvikException.h>

#include <algorithm>
#include <cstring>
#include <exception>
#include <set>

namespace boundary {

namespace {

/// What `tarvik_last_error` shows. Of fixed size, so that recording an error cannot fail, and trivially destroyed, so
/// that no thread keeps the library loaded.
struct LastError {
    tarvik_error error{TARVIK_OK, 0, "", "", "", "", ""};
    char text[1024];
};

thread_local LastError lastError;

tarvik_status record(tarvik_error error) noexcept {
    const std::size_t length = std::min(std::strlen(error.text), sizeof lastError.text - 1);
    std::memcpy(lastError.text, error.text, length);
    lastError.text[length] = '\0';
    lastError.error = error;
    lastError.error.text = lastError.text;
    return static_cast<tarvik_status>(error.status);
}

tarvik_status record(tarvik_status status, const char* type, const TarvikException& exception) noexcept {
    return record({status, exception.line(), type, exception.product(), exception.source(),
                   exception.revision(), exception.what()});
}

tarvik_status record(tarvik_status status, const char* type, const char* text) noexcept {
    return record({status, 0, type, "", "", "", text});
}

} // namespace

tarvik_status recordException() noexcept {
    try {
        throw;
    } catch (const Refusal& refusal) {
        return record(refusal.status, "", refusal.text);
    } catch (const DataMismatchException& exception) {
        return record(TARVIK_DATA_MISMATCH, "DataMismatchException", exception);
    } catch (const OutOfRangeException& exception) {
        return record(TARVIK_OUT_OF_RANGE, "OutOfRangeException", exception);
    } catch (const DataNotFoundException& exception) {
        return record(TARVIK_DATA_NOT_FOUND, "DataNotFoundException", exception);
    } catch (const LogicException& exception) {
        return record(TARVIK_OTHER_EXCEPTION, "LogicException", exception);
    } catch (const TarvikException& exception) {
        return record(TARVIK_OTHER_EXCEPTION, "TarvikException", exception);
    } catch (const std::bad_alloc&) {
        return record(TARVIK_NO_MEMORY, "std::bad_alloc", "memory ran out");
    } catch (const std::exception& exception) {
        return record(TARVIK_OTHER_EXCEPTION, "std::exception", exception.what());
    } catch (...) {
        return record(TARVIK_OTHER_EXCEPTION, "", "an exception of an unknown type");
    }
}

void recordCallbackException() noexcept {
    recordException();
    lastError.error.status = TARVIK_CALLBACK_FAILED;
}

const char* intern(const StringBase& name) {
    static ConstraintsManager::TextSet names;
    return names.insert(name).first->c_str();
}

} // namespace boundary

extern "C" const tarvik_error* tarvik_last_error() { return &boundary::lastError.error; }
