// Reads the parameters of messages.
#include "lsp/Params.h"

#include "lsp/Protocol.h"
#include "text/Uri.h"

#include <fmt/format.h>

namespace lsp {

const std::string& textOf(const Json& json) {
    if (!json.is_string()) {
        throw RequestError(ErrorCode::INVALID_PARAMS, "a text is expected");
    }
    return json.get_ref<const std::string&>();
}

std::string pathIn(const Json& params) {
    const std::string& uri = textOf(params.at("textDocument").at("uri"));
    std::string path = pathOf(uri);
    if (path.empty()) {
        throw RequestError(ErrorCode::INVALID_PARAMS, fmt::format("{} is no file", uri));
    }
    return path;
}

Json member(const Json& json, std::initializer_list<const char*> names) {
    const Json* found = &json;
    for (const char* const name : names) {
        if (!found->is_object() || !found->contains(name)) {
            return {};
        }
        found = &(*found)[name];
    }
    return *found;
}

bool isTrue(const Json& json) { return json.is_boolean() && json.get<bool>(); }

} // namespace lsp
