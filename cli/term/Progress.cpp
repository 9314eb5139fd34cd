// A progress bar without control sequences, which a dumb terminal would show: a carriage return is enough.
#include "term/Progress.h"

#include "term/Output.h"
#include "term/Streams.h"
#include "term/Terminal.h"

#include <fmt/format.h>

#include <algorithm>
#include <utility>

namespace {

constexpr std::chrono::milliseconds PATIENCE{1000};
constexpr std::chrono::milliseconds PAUSE{100};
constexpr std::size_t WIDEST_BAR = 30;

std::size_t widthOfStandardError() {
    const Terminal terminal(streams::ERRORS, Terminal::Colours::NEVER);
    return terminal.isTerminal() ? terminal.width() : 0;
}

} // namespace

Progress::Progress(std::string task)
    : Progress(std::move(task), widthOfStandardError(), std::chrono::steady_clock::now, writeErrorRaw) {}

Progress::Progress(std::string task, std::size_t width, Clock clock, Write write)
    : m_task(std::move(task)), m_width(width), m_clock(std::move(clock)), m_write(std::move(write)),
      m_next(m_clock() + PATIENCE) {}

Progress::~Progress() {
    if (m_drawn != 0) {
        m_write('\r' + std::string(m_drawn, ' ') + '\r');
    }
}

void Progress::reach(std::size_t done, std::size_t total) {
    if (m_width == 0 || total == 0) {
        return;
    }
    const std::chrono::steady_clock::time_point now = m_clock();
    if (now < m_next) {
        return;
    }
    m_next = now + PAUSE;
    const std::string text = line(done, total);
    const std::size_t rest = m_drawn - std::min(m_drawn, text.size());
    m_write('\r' + text + std::string(rest, ' '));
    m_drawn = std::max(m_drawn, text.size());
}

std::string Progress::line(std::size_t done, std::size_t total) const {
    const std::size_t reached = std::min(done, total);
    const std::string text = fmt::format("tarvik: {}: {:3} %", m_task, reached * 100 / total);
    // The last column stays free: some terminals continue on the next line after a character there.
    const std::size_t room = m_width - 1;
    constexpr std::size_t AROUND_BAR = 3;
    if (text.size() + AROUND_BAR >= room) {
        return text.substr(0, room);
    }
    const std::size_t bar = std::min(WIDEST_BAR, room - text.size() - AROUND_BAR);
    const std::size_t full = reached * bar / total;
    return fmt::format("{} [{}{}]", text, std::string(full, '#'), std::string(bar - full, '.'));
}
