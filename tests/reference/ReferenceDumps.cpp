// The reference's dumps.
#include "Reference.h"

namespace reference {

namespace {

/// A text cut to `length` bytes and filled up with blanks to `width`.
std::string cell(const std::string& text, std::size_t width, std::size_t length) {
    std::string shown = text.substr(0, length);
    shown.resize(std::max(width, shown.size()), ' ');
    return shown;
}

/// What becomes of a text that is handed over in the place of a format.
std::string formatted(const std::string& text) {
    std::string result;
    for (std::size_t at = 0; at < text.size(); ++at) {
        result += text[at];
        if (text.substr(at, 2) == "%%") {
            ++at;
        }
    }
    return result;
}

} // namespace

void Reference::emit(std::string* recorder, const std::string& piece) {
    if (recorder != nullptr) {
        *recorder += formatted(piece);
    } else {
        m_messages.push_back({Channel::STATUS, 1777, formatted(piece)});
    }
}

void Reference::dumpOperationsTable(std::string* recorder) {
    emit(recorder, cell("", 15, 15));
    for (int operation = 0; operation < 32; ++operation) {
        emit(recorder, cell(operationType2String(static_cast<TARVIKNS::OP_TYPE>(operation)), 60, 60));
    }
    emit(recorder, "\n");
    emit(recorder, cell("", 15, 15));
    for (int operation = 0; operation < 32; ++operation) {
        for (int mode = 0; mode < 6; ++mode) {
            emit(recorder, cell(modeType2String(static_cast<TARVIKNS::MODE_TYPE>(mode)), 10, 10));
        }
    }
    emit(recorder, "\n");
    emit(recorder, cell("", 15, 15));
    for (int operation = 0; operation < 32; ++operation) {
        for (int mode = 0; mode < 6; ++mode) {
            for (int output = 0; output < 5; ++output) {
                emit(recorder, cell(cableType2String(static_cast<TARVIKNS::OUTPUT_TYPE>(output)), 2, 1));
            }
        }
    }
    emit(recorder, "\n");
    for (const std::string& name : m_supportedDevices) {
        emit(recorder, cell(name, 15, 15));
        for (int operation = 0; operation < 32; ++operation) {
            for (int mode = 0; mode < 6; ++mode) {
                for (int output = 0; output < 5; ++output) {
                    emit(recorder, m_operations.contains({name, operation, mode, output}) ? "1 " : "0 ");
                }
            }
        }
        emit(recorder, "\n");
    }
}

void Reference::dumpBsdlOperationsTable(std::string* recorder) {
    emit(recorder, cell("", 15, 15));
    for (int operation = 0; operation < 32; ++operation) {
        emit(recorder, cell(operationType2String(static_cast<TARVIKNS::OP_TYPE>(operation)), 10, 6));
    }
    emit(recorder, "\n");
    emit(recorder, cell("", 15, 15));
    for (int operation = 0; operation < 32; ++operation) {
        for (int output = 0; output < 5; ++output) {
            emit(recorder, cell(cableType2String(static_cast<TARVIKNS::OUTPUT_TYPE>(output)), 2, 1));
        }
    }
    emit(recorder, "\n");
    for (const std::string& name : m_supportedDevices) {
        emit(recorder, cell(name, 15, 15));
        for (int operation = 0; operation < 32; ++operation) {
            for (int output = 0; output < 5; ++output) {
                emit(recorder, m_bsdlOperations.contains({name, operation, output}) ? "1 " : "0 ");
            }
        }
        emit(recorder, "\n");
    }
}

void Reference::dumpProgramOptionsTable(std::string* recorder) {
    emit(recorder, cell("", 15, 15));
    for (int option = 0; option < 24; ++option) {
        emit(recorder, cell(optionType2String(static_cast<TARVIKNS::PROGRAM_OPTION>(option)), 60, 60));
    }
    emit(recorder, "\n");
    emit(recorder, cell("", 15, 15));
    for (int option = 0; option < 24; ++option) {
        for (int mode = 0; mode < 6; ++mode) {
            emit(recorder, cell(modeType2String(static_cast<TARVIKNS::MODE_TYPE>(mode)), 10, 10));
        }
    }
    emit(recorder, "\n");
    emit(recorder, cell("", 15, 15));
    for (int option = 0; option < 24; ++option) {
        for (int mode = 0; mode < 6; ++mode) {
            for (int output = 0; output < 5; ++output) {
                emit(recorder, cell(cableType2String(static_cast<TARVIKNS::OUTPUT_TYPE>(output)), 2, 1));
            }
        }
    }
    emit(recorder, "\n");
    for (const std::string& name : m_programOptionPackages) {
        emit(recorder, cell(name, 15, 15));
        for (int option = 0; option < 24; ++option) {
            for (int mode = 0; mode < 6; ++mode) {
                for (int output = 0; output < 5; ++output) {
                    emit(recorder, m_options.contains({name, option, mode, output}) ? "1 " : "0 ");
                }
            }
        }
        emit(recorder, "\n");
    }
}

void Reference::dumpCachedDeviceFamilies(std::string* recorder) {
    for (const auto& [device, family] : m_deviceFamilyCache) {
        emit(recorder, "Device " + device + " belongs to " + family + "\n");
    }
}

void Reference::dumpMbBpiSpi() {
    for (const auto& [type, devices] : m_multibootTypes) {
        m_messages.push_back({Channel::STATUS, 1777, type + ":"});
        for (const std::string& device : devices) {
            m_messages.push_back({Channel::STATUS, 1777, " " + device});
        }
        m_messages.push_back({Channel::STATUS, 1777, "\n"});
    }
}

} // namespace reference
