#include <FailingHost.h>
#include <HostCall.h>

#include <cstring>
#include <new>

// The in-memory host again, with a failure at one of its calls.

namespace {

struct State {
    std::size_t calls = 0;
    std::size_t failing = 0; ///< the number of the call that fails; 0 for none
    failing_host::Failure failure = failing_host::Failure::TARVIK_EXCEPTION;
    failing_host::Extent extent = failing_host::Extent::ONE_CALL;
    int reports = 0;
    std::vector<std::string> reads;
    std::vector<std::string> events;
};

State& state() {
    static State held;
    return held;
}

bool fails(const State& host) {
    return host.failing != 0 && (host.extent == failing_host::Extent::ONE_CALL ? host.calls == host.failing
                                                                               : host.calls >= host.failing);
}

} // namespace

void hostCall(const char* service, const char* database, const char* key) {
    State& host = state();
    ++host.calls;
    if (fails(host)) {
        if (host.failure == failing_host::Failure::BAD_ALLOC) {
            throw std::bad_alloc();
        }
        throw failing_host::InjectedException();
    }
    if (std::strcmp(service, "getstringbykey") == 0) {
        host.reads.push_back(std::string(database) + " " + key);
    }
}

void hostClosed(const char* database) noexcept { state().events.push_back(std::string("close ") + database); }

namespace failing_host {

InjectedException::~InjectedException() = default;

void InjectedException::report() const {
    ++state().reports;
    state().events.emplace_back("report");
}

void failAt(std::size_t call, Failure failure, Extent extent) {
    state() = {0, call, failure, extent, 0, {}, {}};
}

void serve() { state() = {}; }

bool hasFailed() { return state().failing != 0 && state().calls >= state().failing; }

int reports() { return state().reports; }

const std::vector<std::string>& events() { return state().events; }

const std::vector<std::string>& reads() { return state().reads; }

} // namespace failing_host
