// The life of a server, the errors of the protocol, and documents.
#include "Editor.h"

#include <gtest/gtest.h>

namespace {

using Codes = std::vector<std::string>;

const DatabaseDirectory::Files CLEAN{{"base.acd", "DEVICE_SUPPORTED       = base,kestrel\n"
                                                  "PROGRAM_OPTION_PACKAGE = base,kestrel\n"
                                                  "IDCODE                 = KS50,0xX4104FB7\n"},
                                     {"kestrel.acd", "[KS50]\n"}};

constexpr int PARSE_ERROR = -32700;
constexpr int INVALID_REQUEST = -32600;
constexpr int METHOD_NOT_FOUND = -32601;
constexpr int INVALID_PARAMS = -32602;
constexpr int NOT_INITIALIZED = -32002;
constexpr int REQUEST_FAILED = -32803;
constexpr int CANCELLED = -32800;

/// The code of the error in the only message.
int onlyError(Editor& editor) {
    const std::vector<Json> all = editor.take();
    return all.size() == 1 ? all.front().at("error").at("code").get<int>() : 0;
}

} // namespace

TEST(LspLife, EndsWithZeroAfterAShutdown) {
    Editor editor(CLEAN);
    EXPECT_TRUE(editor.ask("shutdown").is_null());
    EXPECT_EQ(editor.errorOf("textDocument/hover"), INVALID_REQUEST);
    EXPECT_FALSE(editor.server().hasEnded());
    editor.notify("exit");
    EXPECT_TRUE(editor.server().hasEnded());
    EXPECT_EQ(editor.server().status(), ExitCode::YES);
}

TEST(LspLife, EndsWithOneWithoutAShutdown) {
    Editor editor(CLEAN);
    editor.notify("exit");
    EXPECT_TRUE(editor.server().hasEnded());
    EXPECT_EQ(editor.server().status(), ExitCode::NO);
}

TEST(LspLife, TakesNothingBeforeInitialize) {
    Editor editor(CLEAN, Json());
    EXPECT_EQ(editor.errorOf("textDocument/hover"), NOT_INITIALIZED);
    editor.open("kestrel.acd", "x\n");
    EXPECT_TRUE(editor.diagnostics("kestrel.acd").is_null());
    static_cast<void>(editor.ask("initialize"));
    EXPECT_EQ(editor.errorOf("initialize"), INVALID_REQUEST);
}

TEST(LspLife, NegotiatesTheEncodingOfPositions) {
    const auto encoding = [](const Json& encodings) {
        Editor editor(CLEAN, Json());
        const Json general{{"positionEncodings", encodings}};
        return editor.ask("initialize", {{"capabilities", {{"general", general}}}})
            .at("capabilities")
            .at("positionEncoding")
            .get<std::string>();
    };
    EXPECT_EQ(encoding({"utf-32", "utf-8", "utf-16"}), "utf-8");
    EXPECT_EQ(encoding({"utf-16"}), "utf-16");
    EXPECT_EQ(encoding(Json()), "utf-16");
    EXPECT_EQ(encoding(7), "utf-16");
}

TEST(LspErrors, AreThoseOfTheProtocol) {
    Editor editor(CLEAN);
    static_cast<void>(editor.take());
    const std::vector<std::pair<std::string, int>> cases{
        {"{", PARSE_ERROR},
        {"", PARSE_ERROR},
        {"\xff", PARSE_ERROR},
        {std::string(1'000'000, '['), PARSE_ERROR},
        {std::string(1'000'000, '[') + std::string(1'000'000, ']'), PARSE_ERROR},
        {"[]", INVALID_REQUEST},
        {"7", INVALID_REQUEST},
        {"null", INVALID_REQUEST},
        {"{}", INVALID_REQUEST},
        {R"({"id": 1})", INVALID_REQUEST},
        {R"({"id": 1, "method": 7})", INVALID_REQUEST},
        {R"({"id": 1.5, "method": "shutdown"})", INVALID_REQUEST},
        {R"({"id": null, "method": "shutdown"})", INVALID_REQUEST},
        {R"({"id": [[]], "method": "shutdown"})", INVALID_REQUEST},
        {R"({"id": 1, "method": "no/such"})", METHOD_NOT_FOUND},
        {R"({"id": 1, "method": ""})", METHOD_NOT_FOUND},
        {R"({"id": 1, "method": "textDocument/hover"})", INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": []})", INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": 7})", INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": null})", INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": {"textDocument": {"uri": 7}}})",
         INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": {"textDocument": {"uri": "http://x/y"}}})",
         INVALID_PARAMS},
        {R"({"id": 1, "method": "textDocument/hover", "params": {"textDocument": {"uri": "file:///x.acd"}}})",
         INVALID_PARAMS},
    };
    for (const auto& [content, code] : cases) {
        editor.sendRaw(framed(content));
        EXPECT_EQ(onlyError(editor), code) << content.substr(0, 100);
    }
    editor.sendRaw("Content-Length: none\r\n\r\n");
    EXPECT_EQ(onlyError(editor), PARSE_ERROR);
    EXPECT_TRUE(editor.ask("workspace/symbol", {{"query", ""}}).is_array());
}

TEST(LspErrors, NeverAnswerNotifications) {
    Editor editor(CLEAN);
    editor.open("kestrel.acd", "[KS50]\n");
    static_cast<void>(editor.take());
    editor.notify("no/such");
    editor.notify("$/setTrace", {{"value", "off"}});
    editor.sendRaw(framed(R"({"id": 3, "result": null})"));
    EXPECT_TRUE(editor.take().empty());
    for (const char* const method : {"textDocument/didOpen", "textDocument/didChange", "textDocument/didSave",
                                     "textDocument/didClose"}) {
        editor.notify(method);
        const std::vector<Json> all = editor.take();
        ASSERT_EQ(all.size(), 1U) << method;
        EXPECT_EQ(all.front().at("method"), "window/logMessage") << method;
    }
    editor.change("base.acd", Json::array({{{"text", ""}}}));
    EXPECT_EQ(editor.take().size(), 1U);
}

TEST(LspErrors, CancelWhatWaits) {
    Editor editor(CLEAN);
    static_cast<void>(editor.take());
    const Json symbols = request(70, "workspace/symbol", {{"query", ""}});
    const Json cancel = notification("$/cancelRequest", {{"id", 70}});
    editor.sendRaw(framed(symbols.dump()) + framed(cancel.dump()));
    EXPECT_EQ(onlyError(editor), CANCELLED);
    editor.send(cancel);
    editor.send(notification("$/cancelRequest"));
    editor.send(notification("$/cancelRequest", {{"id", Json::array()}}));
    editor.send(symbols); // a cancelled id may be used again
    EXPECT_TRUE(editor.take().front().contains("result"));
}

TEST(LspErrors, RefuseFilesThatAreNotOfADatabase) {
    Editor editor(CLEAN);
    editor.open("notes.txt", "x\n");
    EXPECT_EQ(editor.errorOf("textDocument/hover", editor.at("notes.txt", 0, 0)), REQUEST_FAILED);
}

TEST(LspErrors, TakeAnyPosition) {
    Editor editor(CLEAN);
    editor.open("kestrel.acd", "[KS50]\nPROPERTY = A,\xC3\xA9\xF0\x9F\x98\x80 \\\n   :B,1\n");
    for (const std::uint64_t line : {0U, 1U, 2U, 3U, 4U, 5000U, 4294967295U}) {
        for (const std::uint64_t character : {0U, 1U, 5U, 15U, 16U, 17U, 18U, 4294967295U}) {
            for (const char* const method :
                 {"hover", "completion", "definition", "references", "prepareRename"}) {
                Json params = editor.document("kestrel.acd");
                params["position"] = {{"line", line}, {"character", character}};
                EXPECT_TRUE(editor.answer(std::string("textDocument/") + method, params).contains("result"))
                    << method << ' ' << line << ' ' << character;
            }
        }
    }
    for (const Json& number : {Json(-1), Json(1.5), Json("0"), Json()}) {
        Json params = editor.document("kestrel.acd");
        params["position"] = {{"line", number}, {"character", 0}};
        EXPECT_EQ(editor.errorOf("textDocument/hover", params), INVALID_PARAMS);
    }
}

TEST(LspDocuments, AreCheckedBeforeTheyAreSaved) {
    Editor editor(CLEAN);
    editor.open("kestrel.acd", "[KS50]\n");
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{});
    editor.replaceText("kestrel.acd", "[KS50]\n[KS100]\n");
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{"D105"});
    editor.open("base.acd", CLEAN.at("base.acd") + "IDCODE += :KS100,0xX4108FB7\n");
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{});
}

TEST(LspDocuments, TakeEditsOfRanges) {
    Editor editor(CLEAN);
    editor.open("kestrel.acd", "[KS50]\nX = 1\n");
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{"K102"});
    const auto range = [](int startLine, int start, int endLine, int end) {
        return Json{{"start", {{"line", startLine}, {"character", start}}},
                    {"end", {{"line", endLine}, {"character", end}}}};
    };
    editor.change("kestrel.acd", Json::array({{{"range", range(1, 0, 1, 1)}, {"text", "PROPERTY"}},
                                              {{"range", range(1, 11, 1, 12)}, {"text", "A,1"}}}));
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{});
    // Ends after the line and after the document; a start after its end.
    editor.change("kestrel.acd", Json::array({{{"range", range(0, 900, 0, 901)}, {"text", "\nX = 1"}},
                                              {{"range", range(900, 0, 900, 5)}, {"text", "Y = 1\n"}},
                                              {{"range", range(0, 4, 0, 1)}, {"text", ""}}}));
    EXPECT_EQ(editor.codes("kestrel.acd"), (Codes{"K102", "K102"}));
    // One invalid change: none of them is taken over.
    editor.change("kestrel.acd", Json::array({{{"text", "[KS50]\n"}}, {{"range", 7}, {"text", ""}}}));
    EXPECT_EQ(editor.codes("kestrel.acd"), (Codes{"K102", "K102"}));
}

TEST(LspDocuments, HaveColumnsInUnitsOfTheEncoding) {
    const auto column = [](const Json& initialization) {
        Editor editor(CLEAN, initialization);
        editor.open("kestrel.acd", "[KS50]\nPROPERTY = T,\xC3\xA9\xF0\x9F\x98\x80: A,1\n");
        return editor.diagnostics("kestrel.acd").at(0).at("range").at("start").at("character").get<int>();
    };
    EXPECT_EQ(column(Json::object()), 17);
    EXPECT_EQ(column({{"capabilities", {{"general", {{"positionEncodings", {"utf-8"}}}}}}}), 20);
}

TEST(LspDocuments, GiveWayToTheFileWhenTheyAreClosed) {
    Editor editor(CLEAN);
    editor.open("base.acd", CLEAN.at("base.acd"));
    editor.open("kestrel.acd", "[KS50]\nX = 1\n");
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{"K102"});
    editor.notify("textDocument/didClose", editor.document("kestrel.acd"));
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{});
    editor.replaceText("base.acd", "X = 1\n");
    EXPECT_FALSE(editor.codes("base.acd").empty());
    editor.notify("textDocument/didClose", editor.document("base.acd"));
    EXPECT_EQ(editor.codes("base.acd"), Codes{});
}

TEST(LspDocuments, MayBeNewFiles) {
    Editor editor(DatabaseDirectory::Files{});
    editor.open("kestrel.acd", "[KS50]\n");
    ASSERT_EQ(editor.diagnostics("kestrel.acd").size(), 1U);
    EXPECT_NE(editor.diagnostics("kestrel.acd").at(0).at("message").get<std::string>().find("no base.acd"),
              std::string::npos);
    editor.open("base.acd", CLEAN.at("base.acd"));
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{});
    EXPECT_EQ(editor.codes("base.acd"), Codes{});
}

TEST(LspDocuments, FollowFilesThatOtherProgramsChange) {
    Editor editor(CLEAN);
    editor.open("kestrel.acd", "[KS50]\n");
    std::ofstream(editor.path("base.acd")) << "IDCODE = KS50,0xX4104FB7\n";
    editor.notify("workspace/didChangeWatchedFiles", {{"changes", Json::array()}});
    EXPECT_FALSE(editor.codes("base.acd").empty());
    std::filesystem::remove(editor.path("base.acd"));
    editor.notify("workspace/didChangeWatchedFiles", {{"changes", Json::array()}});
    EXPECT_EQ(editor.codes("base.acd"), Codes{});
    EXPECT_EQ(editor.codes("kestrel.acd"), Codes{"none"});
}

TEST(LspDocuments, OfALayerBelongToAllLayers) {
    const DatabaseDirectory below(CLEAN);
    for (const bool isOption : {false, true}) {
        const DatabaseDirectory site(DatabaseDirectory::Files{{"base.acd", "IDCODE += :KS100,0xX4108FB7\n"}});
        const std::vector<std::string> layers{site.path(), below.path()};
        // As the environment names them, too.
        const std::string joined = site.path() + "/:" + below.path();
        const Json options{{"initializationOptions", {{"database", joined}}}};
        Editor editor(DatabaseDirectory::Files{}, isOption ? options : Json::object(),
                      isOption ? std::vector<std::string>{} : layers);
        const std::string path = site.path("kestrel.acd");
        editor.send(openingOf(path, "[KS100]\nX = 1\n"));
        const std::vector<Json> all = editor.take();
        ASSERT_EQ(all.back().at("params").at("uri"), asUri(path));
        ASSERT_EQ(all.back().at("params").at("diagnostics").size(), 1U);
        EXPECT_EQ(all.back().at("params").at("diagnostics").at(0).at("code"), "K102");
    }
}
