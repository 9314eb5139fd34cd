// Messages on their way to the callback of a C application.
#include "Boundary.h"

#include <Port_MsgManData.h>

#include <string>
#include <utility>

using namespace boundary;

namespace {

static_assert(TARVIK_CHANNEL_INFO == static_cast<int>(Port_MsgManData::Channel::INFO));
static_assert(TARVIK_CHANNEL_STATUS == static_cast<int>(Port_MsgManData::Channel::STATUS));
static_assert(TARVIK_CHANNEL_DEBUG == static_cast<int>(Port_MsgManData::Channel::DEBUG));

/// Calls the callback. What it throws does not interrupt the manager, which may be in the middle of loading a device.
void deliver(tarvik_message_callback callback, void* context, const Port_MsgManData::Message& message) {
    // A view need not end with a NUL.
    const std::string product(message.product);
    const std::string source(message.source);
    const std::string revision(message.revision);
    const std::string text(message.text);
    const tarvik_message delivered{static_cast<int>(message.channel),
                                   message.line,
                                   product.c_str(),
                                   source.c_str(),
                                   revision.c_str(),
                                   text.c_str()};
    const Session before = session;
    session.inCallback = true;
    bool failed = false;
    try {
        callback(&delivered, context);
    } catch (...) {
        recordCallbackException();
        failed = true;
    }
    session.inCallback = before.inCallback;
    session.callbackFailed = before.callbackFailed || failed; // conversions in the callback reset it
}

} // namespace

extern "C" tarvik_status tarvik_set_message_callback(tarvik_message_callback callback, void* context) {
    return guard([&] {
        requireOutsideOfCallback();
        Port_MsgManData::Sink sink;
        if (callback != nullptr) {
            sink = [=](const Port_MsgManData::Message& message) { deliver(callback, context, message); };
        }
        Port_MsgManData::setSink(std::move(sink));
    });
}
