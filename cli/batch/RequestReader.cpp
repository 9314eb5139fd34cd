// Reads requests strictly: a name that is unknown or given twice is an error of the caller, which must be reported.
#include "batch/RequestReader.h"

#include "text/Trimmed.h"

#include <fmt/format.h>

#include <algorithm>
#include <vector>

namespace {

/// Far more than any request needs. Deeper values would exhaust the stack when they are written.
constexpr std::size_t MAX_DEPTH = 32;
constexpr std::size_t MAX_NAMES = 64;

/// Builds a value from what the parser reads, and stops at the first fault.
class StrictReader : public nlohmann::json_sax<Json> {
public:
    [[nodiscard]] Json& value() noexcept { return m_root; }
    [[nodiscard]] const std::string& fault() const noexcept { return m_fault; }

    /// After a fault: the request's id, if it was read to its end.
    [[nodiscard]] Json takeId() {
        const bool has = m_root.is_object() && m_root.contains("id");
        const bool inside = has && m_open.size() > 1 && m_open[1] == &m_root["id"];
        return has && !inside ? std::move(m_root["id"]) : Json();
    }

    bool null() override { return put(nullptr); }
    bool boolean(bool value) override { return put(value); }
    bool number_integer(std::int64_t value) override { return put(value); }
    bool number_unsigned(std::uint64_t value) override { return put(value); }
    bool number_float(double value, const std::string&) override { return put(value); }
    bool string(std::string& value) override { return put(std::move(value)); }
    bool binary(Json::binary_t&) override { return refuse("binary values are unknown"); }

    bool start_object(std::size_t) override { return open(Json::object()); }
    bool end_object() override { return close(); }
    bool start_array(std::size_t) override { return open(Json::array()); }
    bool end_array() override { return close(); }

    bool key(std::string& name) override {
        Json& object = *m_open.back();
        if (object.contains(name)) {
            return refuse(fmt::format("the name \"{}\" is given twice", name));
        }
        if (object.size() == MAX_NAMES) {
            return refuse("too many names");
        }
        m_name = std::move(name);
        return true;
    }

    bool parse_error(std::size_t position, const std::string&, const nlohmann::detail::exception&) override {
        return refuse(fmt::format("not JSON, see byte {}", position));
    }

private:
    bool refuse(std::string fault) {
        m_fault = std::move(fault);
        return false;
    }

    Json& place(Json value) {
        if (m_open.empty()) {
            return m_root = std::move(value);
        }
        Json& parent = *m_open.back();
        if (parent.is_array()) {
            parent.push_back(std::move(value));
            return parent.back();
        }
        return parent[m_name] = std::move(value);
    }

    bool put(Json value) {
        place(std::move(value));
        return true;
    }

    bool open(Json value) {
        if (m_open.size() == MAX_DEPTH) {
            return refuse("nested too deep");
        }
        m_open.push_back(&place(std::move(value)));
        return true;
    }

    bool close() {
        m_open.pop_back();
        return true;
    }

    Json m_root;
    std::vector<Json*> m_open; ///< the arrays and objects that are not closed yet
    std::string m_name;        ///< of the value to come
    std::string m_fault;
};

/// The end of the string that begins at this offset of a JSON text.
std::size_t endOfString(std::string_view text, std::size_t start) {
    std::size_t end = start + 1;
    while (end < text.size() && text[end] != '"') {
        end += text[end] == '\\' ? 2U : 1U;
    }
    return std::min(end + 1, text.size());
}

/// The value of "id" as a request writes it: numbers have more digits there than a double keeps.
/// @param line a JSON object, valid up to the end of that member
std::string_view idTextOf(std::string_view line) {
    constexpr std::size_t NONE = std::string_view::npos;
    std::size_t depth = 0;
    std::string_view text;
    std::size_t start = NONE;
    for (std::size_t i = 0; i < line.size(); ++i) {
        const char byte = line[i];
        if (byte == '"') {
            const std::size_t end = endOfString(line, i);
            text = line.substr(i, end - i);
            i = end - 1;
        } else if (depth == 1 && byte == ':' && Json::parse(text, nullptr, false) == "id") {
            start = i + 1;
        } else if (depth == 1 && (byte == ',' || byte == '}') && start != NONE) {
            return trimmed(line.substr(start, i - start), " \t\r\n");
        } else if (byte == '{' || byte == '[') {
            ++depth;
        } else if (byte == '}' || byte == ']') {
            --depth;
        }
    }
    return {};
}

/// Takes the members of a request; @return what is wrong with them.
std::string takeMembers(Json& object, Request& request) {
    if (!object.is_object()) {
        return "a request is an object";
    }
    request.arguments = Json::array();
    bool called = false;
    std::string fault;
    for (auto& [name, value] : object.get_ref<Json::object_t&>()) {
        if (name == "id") {
            request.id = std::move(value);
        } else if (name == "call" && value.is_string()) {
            request.call = std::move(value.get_ref<std::string&>());
            called = true;
        } else if (name == "args" && value.is_structured()) {
            request.arguments = std::move(value);
        } else if (name == "call") {
            fault = "\"call\" is a text";
        } else if (name == "args") {
            fault = "\"args\" is an array or an object";
        } else {
            fault = fmt::format("a request has no \"{}\"", name);
        }
    }
    return !fault.empty() || called ? fault : "a request has a \"call\"";
}

} // namespace

Request readRequest(std::string_view line) {
    Request request;
    // The parser ends at a NUL and would ignore what follows.
    if (line.find('\0') != std::string_view::npos) {
        request.fault = "a NUL byte";
        return request;
    }
    StrictReader reader;
    if (Json::sax_parse(line, &reader)) {
        request.fault = takeMembers(reader.value(), request);
    } else {
        request.fault = reader.fault();
        request.id = reader.takeId();
    }
    if (!request.id.is_null()) {
        request.idText = idTextOf(line);
    }
    return request;
}
