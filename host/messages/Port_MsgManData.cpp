#include "Port_MsgManData.h"

#include "text/Formatting.h"
#include "text/NullToEmpty.h"

#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <string>
#include <string_view>
#include <utility>

// Where messages are made, and the one sink that they go out through.

namespace {

/// The process's sink. Never destroyed, as destructors of others may still speak at exit; a shared one, so that
/// a sink that replaces itself lives until its own call is over.
std::shared_ptr<const Port_MsgManData::Sink>& currentSink() {
    static auto& sink = *new std::shared_ptr<const Port_MsgManData::Sink>;
    return sink;
}

void writeToStream(std::FILE* stream, std::string_view text) {
    std::fwrite(text.data(), 1, text.size(), stream);
}

void sendByDefault(const Port_MsgManData::Message& message) {
    switch (message.channel) {
    case Port_MsgManData::Channel::INFO:
        writeToStream(stderr, message.text);
        break;
    case Port_MsgManData::Channel::STATUS:
        writeToStream(stdout, message.text);
        break;
    case Port_MsgManData::Channel::DEBUG:
        if (std::getenv("TARVIK_DEBUG") != nullptr) {
            writeToStream(stderr, message.text);
        }
        break;
    }
}

void send(const Port_MsgManData::Message& message) {
    const std::shared_ptr<const Port_MsgManData::Sink> sink = currentSink();
    if (sink != nullptr) {
        (*sink)(message);
    } else {
        sendByDefault(message);
    }
}

void sendDebug(std::string_view text) { send({Port_MsgManData::Channel::DEBUG, "", "", 0, "", text}); }

} // namespace

Port_MsgManData::Sink Port_MsgManData::setSink(Sink sink) {
    auto next = sink ? std::make_shared<const Sink>(std::move(sink)) : nullptr;
    auto& current = currentSink();
    // A copy, as the former sink may be in the middle of a call; made first, so that failing changes nothing.
    Sink former = current == nullptr ? Sink() : *current;
    current = std::move(next);
    return former;
}

Port_MsgManData Port_MsgManData::createObject(const char* product, const char* source, int line,
                                              const char* revision) noexcept {
    return {product, source, line, revision};
}

Port_MsgManData::Port_MsgManData(const char* product, const char* source, int line,
                                 const char* revision) noexcept
    : m_product(nullToEmpty(product)), m_source(nullToEmpty(source)), m_line(line),
      m_revision(nullToEmpty(revision)) {}

void Port_MsgManData::issueInfo(const char* text) const {
    send({Channel::INFO, m_product, m_source, m_line, m_revision, formatting::unescapePercent(text)});
}

template <typename Formatted>
void Port_MsgManData::issueInfo(const char* format, ...) const {
    std::va_list arguments;
    va_start(arguments, format);
    const std::string text = formatting::vformat(format, arguments);
    va_end(arguments);
    send({Channel::INFO, m_product, m_source, m_line, m_revision, text});
}
template TARVIK_HOST_API void Port_MsgManData::issueInfo<void>(const char* format, ...) const;

void Port_MsgManData::issueStatus(const char* text) const {
    send({Channel::STATUS, m_product, m_source, m_line, m_revision, formatting::unescapePercent(text)});
}

template <typename Formatted>
void Port_MsgManData::issueStatus(const char* format, ...) const {
    std::va_list arguments;
    va_start(arguments, format);
    const std::string text = formatting::vformat(format, arguments);
    va_end(arguments);
    send({Channel::STATUS, m_product, m_source, m_line, m_revision, text});
}
template TARVIK_HOST_API void Port_MsgManData::issueStatus<void>(const char* format, ...) const;

void Port_MsgManData::debugStub(const char* text) { sendDebug(formatting::unescapePercent(text)); }

template <typename Formatted>
void Port_MsgManData::debugStub(const char* format, ...) {
    std::va_list arguments;
    va_start(arguments, format);
    const std::string text = formatting::vformat(format, arguments);
    va_end(arguments);
    sendDebug(text);
}
template TARVIK_HOST_API void Port_MsgManData::debugStub<void>(const char* format, ...);
