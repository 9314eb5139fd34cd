// What an editor asks about a place: fixes, completion, hovers, names, symbols and the canonical form.
#include "Editor.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <map>
#include <set>

namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::UnorderedElementsAre;

const DatabaseDirectory::Files SMALL{{"base.acd", "DEVICE_SUPPORTED = base,finch,spi\n"
                                                  "PROGRAM_OPTION_PACKAGE = FN10P48,base,finch,spi\n"
                                                  "BS = outputs,PARALLEL,USB2:families,finch\n"
                                                  "SS = outputs,PARALLEL:families,finch\n"
                                                  "NOT_SUPPORTED_PART_IN_MODE = SS_FN10_P48\n"
                                                  "IDCODE = FN10,0x00000011:FN20,0x00000021\n"},
                                     {"finch.acd", "OPERATION = PROGRAM,Bscan,PARALLEL,USB2: \\\n"
                                                   "            VERIFY,SSerial,PARALLEL\n"
                                                   "[FN10]\n"
                                                   "PROPERTIES = PACKAGES,2,P48,P64\n"
                                                   "[FN20]\n"
                                                   "PROPERTY = PINS,44\n"},
                                     {"spi.acd", "DEVICE_FAMILY = ST1\n"
                                                 "ST1_DEVICES = FLA,FLB\n"
                                                 "ST1_PROPERTY = BUS,SPI\n"
                                                 "FLA_PROPERTY = DENSITY,1024\n"
                                                 "TYPE_MB_SPI_NONE_LEAD = FLA,FN10\n"}};

/// The database with one file open.
class Small : public Editor {
public:
    explicit Small(const std::string& name, const Json& initialization = Json::object())
        : Editor(SMALL, initialization) {
        open(name, SMALL.at(name));
    }

    std::vector<std::string> complete(const std::string& name, unsigned line, unsigned character) {
        std::vector<std::string> labels;
        const Json list = ask("textDocument/completion", at(name, line, character));
        for (const Json& item : list.at("items")) {
            labels.push_back(item.at("label"));
        }
        return labels;
    }

    /// Completes at the end of one line in place of a file.
    std::vector<std::string> completeAfter(const std::string& name, const std::string& line) {
        replaceText(name, line);
        const auto lines = static_cast<unsigned>(std::count(line.begin(), line.end(), '\n'));
        return complete(name, lines, static_cast<unsigned>(line.size() - (line.rfind('\n') + 1)));
    }

    std::string hover(const std::string& name, unsigned line, unsigned character) {
        const Json found = ask("textDocument/hover", at(name, line, character));
        return found.is_null() ? std::string() : found.at("contents").at("value").get<std::string>();
    }

    /// "name:line:start-end" of each location, counted as the protocol does.
    std::vector<std::string> places(const Json& locations) const {
        std::vector<std::string> all;
        for (const Json& location : locations) {
            const std::string uri = location.at("uri");
            const Json& range = location.at("range");
            all.push_back(fmt::format(
                "{}:{}:{}-{}", uri.substr(uri.rfind('/') + 1), range.at("start").at("line").get<int>(),
                range.at("start").at("character").get<int>(), range.at("end").at("character").get<int>()));
        }
        return all;
    }

    std::vector<std::string> references(const std::string& name, unsigned line, unsigned character) {
        Json params = at(name, line, character);
        params["context"] = {{"includeDeclaration", true}};
        return places(ask("textDocument/references", params));
    }

    std::vector<std::string> definitions(const std::string& name, unsigned line, unsigned character) {
        return places(ask("textDocument/definition", at(name, line, character)));
    }

    Json renaming(const std::string& name, unsigned line, unsigned character, const std::string& newName) {
        Json params = at(name, line, character);
        params["newName"] = newName;
        return answer("textDocument/rename", params);
    }
};

/// A text after edits of the protocol, whose columns are bytes here.
std::string applied(std::string text, const Json& edits) {
    struct Edit {
        std::size_t begin;
        std::size_t end;
        std::string text;
    };
    std::vector<Edit> all;
    const auto offset = [&text](const Json& position) {
        std::size_t start = 0;
        for (int line = position.at("line"); line > 0; --line) {
            start = text.find('\n', start) + 1;
        }
        return start + position.at("character").get<std::size_t>();
    };
    for (const Json& edit : edits) {
        all.push_back(
            {offset(edit.at("range").at("start")), offset(edit.at("range").at("end")), edit.at("newText")});
    }
    std::sort(all.begin(), all.end(),
              [](const Edit& left, const Edit& right) { return left.begin > right.begin; });
    for (const Edit& edit : all) {
        text.replace(edit.begin, edit.end - edit.begin, edit.text);
    }
    return text;
}

const Json CAN_RENAME_FILES{
    {"capabilities",
     {{"workspace", {{"workspaceEdit", {{"documentChanges", true}, {"resourceOperations", {"rename"}}}}}}}}};

} // namespace

TEST(LspFixes, AreOfferedWhereTheFindingIs) {
    Small editor("finch.acd");
    editor.replaceText("finch.acd", "OPERATION = PROGRAM,BS,USB2:VERFIY,Bscan,USB2\n[FN10]\n[FN20]\n");
    const auto actions = [&editor](int start, int end) {
        Json params = editor.document("finch.acd");
        params["range"] = {{"start", {{"line", 0}, {"character", start}}},
                           {"end", {{"line", 0}, {"character", end}}}};
        params["context"] = {{"diagnostics", Json::array()}};
        return editor.ask("textDocument/codeAction", params);
    };
    ASSERT_EQ(actions(0, 45).size(), 2U);
    const Json safe = actions(20, 20);
    ASSERT_EQ(safe.size(), 1U);
    EXPECT_EQ(safe.at(0).at("title"), R"(T105: replace "BS" with "Bscan")");
    EXPECT_TRUE(safe.at(0).at("isPreferred").get<bool>());
    EXPECT_EQ(applied("OPERATION = PROGRAM,BS,USB2:VERFIY,Bscan,USB2\n",
                      safe.at(0).at("edit").at("changes").at(editor.uri("finch.acd"))),
              "OPERATION = PROGRAM,Bscan,USB2:VERFIY,Bscan,USB2\n");
    EXPECT_FALSE(actions(30, 30).at(0).at("isPreferred").get<bool>());
    EXPECT_EQ(actions(30, 30).at(0).at("title"), R"(T101: replace "VERFIY" with "VERIFY" (a guess))");
    EXPECT_TRUE(actions(0, 3).empty());
}

TEST(LspFixes, ChangeOtherFiles) {
    Small editor("finch.acd");
    const std::string text = "PROGRAM_OPTION = ERASE,Bscan,USB2\n";
    editor.replaceText("finch.acd", SMALL.at("finch.acd") + text);
    Json params = editor.document("finch.acd");
    params["range"] = {{"start", {{"line", 6}, {"character", 0}}}, {"end", {{"line", 6}, {"character", 0}}}};
    const Json actions = editor.ask("textDocument/codeAction", params);
    ASSERT_EQ(actions.size(), 1U);
    EXPECT_EQ(actions.at(0).at("title"), R"(K202: insert ",FN20" in base.acd (a guess))");
    const Json& changes = actions.at(0).at("edit").at("changes");
    ASSERT_EQ(changes.size(), 1U);
    EXPECT_THAT(applied(SMALL.at("base.acd"), changes.at(editor.uri("base.acd"))),
                HasSubstr("PROGRAM_OPTION_PACKAGE = FN10P48,base,finch,spi,FN20\n"));
}

TEST(LspFixes, ListAFamilyWhereverItIsUsed) {
    Editor editor(DatabaseDirectory::Files{
        {"base.acd",
         "DEVICE_SUPPORTED = base\r\nBS = outputs,USB2:families\r\nSS = outputs,USB2:families\r\n"}});
    editor.open("wren.acd", "OPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PROGRAM,1,BS\n");
    EXPECT_THAT(editor.codes("wren.acd"), UnorderedElementsAre("B104", "T112"));
    Json params = editor.document("wren.acd");
    params["range"] = {{"start", {{"line", 0}, {"character", 0}}}, {"end", {{"line", 0}, {"character", 0}}}};
    const Json actions = editor.ask("textDocument/codeAction", params);
    ASSERT_EQ(actions.size(), 1U);
    EXPECT_EQ(
        applied("DEVICE_SUPPORTED = base\r\nBS = outputs,USB2:families\r\nSS = outputs,USB2:families\r\n",
                actions.at(0).at("edit").at("changes").at(editor.uri("base.acd"))),
        "PROGRAM_OPTION_PACKAGE = wren\nDEVICE_SUPPORTED = base,wren\r\n"
        "BS = outputs,USB2:families,wren\r\nSS = outputs,USB2:families\r\n");
}

TEST(LspCompletion, OffersTheKeysOfTheFile) {
    Small editor("finch.acd");
    EXPECT_THAT(editor.completeAfter("finch.acd", "PRO"),
                UnorderedElementsAre("PROGRAM_OPTION", "PROPERTY", "PROPERTIES"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "# PRO"), IsEmpty());
    EXPECT_THAT(editor.completeAfter("finch.acd", "[FN10]\n  bs"), ElementsAre("BSDL_OPERATION"));
    Small base("base.acd");
    EXPECT_THAT(base.completeAfter("base.acd", "B"), UnorderedElementsAre("BSDL_OPERATION", "BS", "BSFILE"));
    Small spi("spi.acd");
    EXPECT_THAT(spi.completeAfter("spi.acd", SMALL.at("spi.acd") + "FLB"), ElementsAre("FLB_PROPERTY"));
}

TEST(LspCompletion, OffersTheWordsOfTheField) {
    Small editor("finch.acd");
    EXPECT_THAT(editor.completeAfter("finch.acd", "OPERATION = PROGRAMF"),
                UnorderedElementsAre("PROGRAMFLASH", "PROGRAMFPGAONLY"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "OPERATION = PROGRAM,S"),
                UnorderedElementsAre("SSerial", "Smap", "SPI"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "OPERATION = PROGRAM,Bscan,USB2:VERIFY,Bscan,S"),
                UnorderedElementsAre("SVF", "STAPL"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "OPERATION = PROGRAM,Bscan, \\\n   U"),
                ElementsAre("USB2"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "PROGRAM_OPTION += :VER"), ElementsAre("VERIFY"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "PROPERTIES = VERIFY,1,SM"), ElementsAre("SM"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "PROPERTIES = OP_VERIFY,1,SEC"), Contains("SECUREMODE"));
    EXPECT_THAT(editor.completeAfter("finch.acd", "PROPERTIES = OP_VERIFY,"), IsEmpty());
    EXPECT_THAT(editor.completeAfter("finch.acd", "NOTHING = P"), IsEmpty());
}

TEST(LspCompletion, OffersNames) {
    Small editor("base.acd");
    EXPECT_THAT(editor.completeAfter("base.acd", "IDCODE = f"), UnorderedElementsAre("FN10", "FN20"));
    EXPECT_THAT(editor.completeAfter("base.acd", "DEVICE_SUPPORTED = base,f"),
                UnorderedElementsAre("finch", "FN10", "FN20"));
    EXPECT_THAT(editor.completeAfter("base.acd", "BS = outputs,U"), ElementsAre("USB2"));
    EXPECT_THAT(editor.completeAfter("base.acd", "BS = outputs,USB2:families,f"), ElementsAre("finch"));
    EXPECT_THAT(editor.completeAfter("base.acd", "BS += ,f"), ElementsAre("finch"));
    EXPECT_THAT(editor.completeAfter("base.acd", "BS = "), ElementsAre("outputs"));
    EXPECT_THAT(editor.completeAfter("base.acd", "BS = outputs,USB2:"), ElementsAre("families"));
    const std::string part = "NOT_SUPPORTED_PART_IN_MODE = ";
    EXPECT_THAT(editor.completeAfter("base.acd", part + "SS"), ElementsAre("SS_"));
    EXPECT_THAT(editor.completeAfter("base.acd", part + "SS_FN1"), ElementsAre("SS_FN10_"));
    EXPECT_THAT(editor.completeAfter("base.acd", part + "SS_FN10_"),
                UnorderedElementsAre("SS_FN10_P48", "SS_FN10_P64"));
    Small spi("spi.acd");
    EXPECT_THAT(spi.completeAfter("spi.acd", SMALL.at("spi.acd") + "TYPE_MB_SPI_NONE_CHAIN = F"),
                UnorderedElementsAre("FLA", "FLB", "FN10", "FN20"));
    Small family("finch.acd");
    EXPECT_THAT(family.completeAfter("finch.acd", SMALL.at("finch.acd") + "PROPERTIES = PACKAGES,1,P"),
                UnorderedElementsAre("P48", "P64"));
    EXPECT_THAT(family.completeAfter("finch.acd", SMALL.at("finch.acd") + "PROPERTY += :PI"),
                ElementsAre("PINS"));
    EXPECT_THAT(family.completeAfter("finch.acd", SMALL.at("finch.acd") + "PROPERTY += :PINS,4"),
                ElementsAre("44"));
    EXPECT_THAT(family.completeAfter("finch.acd", "[FN20]\n[F"), UnorderedElementsAre("FN10", "FN20"));
    EXPECT_THAT(spi.completeAfter("spi.acd", "FLA_PROPERTY = PACKAGE,SO8\nFLB_PROPERTY = PACKAGE,S"),
                ElementsAre("SO8"));
}

TEST(LspCompletion, OffersFlashesAndTheirClasses) {
    Small spi("spi.acd");
    EXPECT_THAT(spi.completeAfter("spi.acd", "DEVICE_FAMILY = B"),
                UnorderedElementsAre("BPI1", "BPI2", "BPI3"));
    EXPECT_THAT(spi.completeAfter("spi.acd", SMALL.at("spi.acd") + "ST2_DEVICES = F"),
                UnorderedElementsAre("FLA", "FLB"));
}

TEST(LspCompletion, SaysWhenThereAreMore) {
    Small editor("base.acd");
    std::string sections;
    for (int device = 0; device < 600; ++device) {
        sections += fmt::format("[FN{}]\n", 1000 + device);
    }
    editor.open("finch.acd", sections);
    editor.replaceText("base.acd", "IDCODE = FN1");
    const Json list = editor.ask("textDocument/completion", editor.at("base.acd", 0, 12));
    EXPECT_EQ(list.at("items").size(), 500U);
    EXPECT_TRUE(list.at("isIncomplete").get<bool>());
}

TEST(LspCompletion, ReplacesTheWholeField) {
    Small editor("finch.acd");
    editor.replaceText("finch.acd", "OPERATION = VERIFY:PROG");
    const Json list = editor.ask("textDocument/completion", editor.at("finch.acd", 0, 23));
    EXPECT_EQ(list.at("items").at(0).at("textEdit").at("range").at("start").at("character"), 19);
    EXPECT_FALSE(list.at("isIncomplete").get<bool>());
}

TEST(LspHover, ShowsTheValueInForce) {
    Small editor("finch.acd");
    const std::string shown = editor.hover("finch.acd", 0, 2);
    EXPECT_THAT(shown, HasSubstr("OPERATION = operation,mode,output,...:..."));
    EXPECT_THAT(shown,
                HasSubstr("`PROGRAM,Bscan,PARALLEL,USB2:VERIFY,SSerial,PARALLEL`, set last in finch.acd:1"));
    editor.replaceText("finch.acd", SMALL.at("finch.acd") + "OPERATION = ERASE,Bscan,USB2\n");
    EXPECT_THAT(
        editor.hover("finch.acd", 6, 0),
        HasSubstr("hides `PROGRAM,Bscan,PARALLEL,USB2:VERIFY,SSerial,PARALLEL` of the family, finch.acd:1"));
}

TEST(LspHover, ShowsThePropertyInForce) {
    Small editor("finch.acd");
    editor.replaceText("finch.acd", "PROPERTY = PINS,20\nPROPERTIES = PINS,1,30:OP_VERIFY,1,ERASE\n[FN10]\n"
                                    "PROPERTY = PINS,44:PINS,48\n");
    EXPECT_EQ(editor.hover("finch.acd", 3, 12), "In force: `PINS,48` of FN10, finch.acd:4\n\n"
                                                "hides `PINS,1,30` of the family, finch.acd:2\n\n"
                                                "hides `PINS,20` of the family, finch.acd:1");
    EXPECT_THAT(
        editor.hover("finch.acd", 0, 17),
        HasSubstr("In force: `PINS,1,30` of the family, finch.acd:2\n\nhides `PINS,20` of the family"));
    EXPECT_THAT(editor.hover("finch.acd", 1, 26), HasSubstr("the options of the operation `VERIFY`"));
    Small base("base.acd");
    EXPECT_EQ(base.hover("base.acd", 2, 6), "a label, which is skipped");
}

TEST(LspHover, ShowsLayersAndWhatTheyReplace) {
    const DatabaseDirectory below(SMALL);
    const DatabaseDirectory top(DatabaseDirectory::Files{{"finch.acd", "[FN20]\nPROPERTY = PINS,48\n"}});
    Editor editor(DatabaseDirectory::Files{}, Json::object(), {top.path(), below.path()});
    editor.send(openingOf(top.path("finch.acd"), "[FN20]\nPROPERTY = PINS,48\n"));
    Json params{{"textDocument", {{"uri", asUri(top.path("finch.acd"))}}},
                {"position", {{"line", 1}, {"character", 0}}}};
    const std::string shown = editor.ask("textDocument/hover", params).at("contents").at("value");
    EXPECT_THAT(shown, HasSubstr("`PINS,48`, set last in finch.acd:2 in " + top.path()));
    EXPECT_THAT(shown, HasSubstr("replaces `PINS,44` of finch.acd:6 in " + below.path()));
}

TEST(LspHover, ExplainsWordsNamesAndFindings) {
    Small editor("finch.acd");
    EXPECT_THAT(editor.hover("finch.acd", 0, 21), HasSubstr("mode `BS`: Boundary Scan"));
    EXPECT_THAT(editor.hover("finch.acd", 1, 14), HasSubstr("operation `VERIFY`"));
    EXPECT_THAT(
        editor.hover("finch.acd", 2, 2),
        HasSubstr("device **FN10** of family finch, finch.acd:3; packages P48, P64; IDCODE `0x00000011`"));
    EXPECT_EQ(editor.hover("finch.acd", 5, 17), "In force: `PINS,44` of FN20, finch.acd:6");
    editor.replaceText("finch.acd", "OPERATION = VERFIY,Bscan,USB2\n");
    EXPECT_THAT(editor.hover("finch.acd", 0, 14), HasSubstr("**T101** (error, `unknown-operation`)"));
    editor.replaceText("finch.acd",
                       "PROGRAM_OPTION = VERIFY,Bscan,USB2\nPROPERTIES = PINS,2,44,48\nPROPERTY =\n");
    EXPECT_THAT(editor.hover("finch.acd", 0, 19), HasSubstr("option `VERIFY`"));
    EXPECT_THAT(editor.hover("finch.acd", 0, 31), HasSubstr("output `USB2`"));
    EXPECT_THAT(editor.hover("finch.acd", 1, 18), HasSubstr("the number of values of PINS"));
    Small spi("spi.acd");
    EXPECT_THAT(spi.hover("spi.acd", 4, 25), HasSubstr("flash **FLA** of ST1, spi.acd:2"));
    EXPECT_THAT(spi.hover("spi.acd", 0, 17), HasSubstr("family of flashes **ST1**: 2"));
    Small base("base.acd");
    EXPECT_THAT(base.hover("base.acd", 2, 38), HasSubstr("family **finch**: 2 devices"));
    EXPECT_EQ(base.hover("base.acd", 1, 30), "package **P48**");
}

TEST(LspNames, HaveOneIndexForDefinitionsReferencesAndRename) {
    Small editor("base.acd", CAN_RENAME_FILES);
    const auto device = UnorderedElementsAre("base.acd:1:25-29", "base.acd:4:32-36", "base.acd:5:9-13",
                                             "finch.acd:2:1-5", "spi.acd:4:28-32");
    EXPECT_THAT(editor.references("base.acd", 5, 10), device);
    EXPECT_THAT(editor.references("base.acd", 1, 27), device);
    EXPECT_THAT(editor.references("base.acd", 4, 33), device);
    EXPECT_THAT(editor.definitions("base.acd", 5, 13), ElementsAre("finch.acd:2:1-5"));
    EXPECT_THAT(editor.definitions("base.acd", 1, 31), ElementsAre("finch.acd:3:24-27"));
    EXPECT_THAT(editor.definitions("base.acd", 0, 24), ElementsAre("finch.acd:0:0-0"));
    EXPECT_THAT(editor.references("base.acd", 0, 24),
                UnorderedElementsAre("finch.acd:0:0-0", "base.acd:0:24-29", "base.acd:1:38-43",
                                     "base.acd:2:36-41", "base.acd:3:31-36"));
    Small spi("spi.acd");
    EXPECT_THAT(spi.references("spi.acd", 4, 24),
                UnorderedElementsAre("spi.acd:1:14-17", "spi.acd:3:0-3", "spi.acd:4:24-27"));
    EXPECT_THAT(spi.definitions("spi.acd", 3, 1), ElementsAre("spi.acd:1:14-17"));
    EXPECT_THAT(spi.definitions("spi.acd", 2, 1), ElementsAre("spi.acd:0:16-19"));
}

TEST(LspNames, AreRenamedInAllFiles) {
    Small editor("base.acd", CAN_RENAME_FILES);
    const Json changes = editor.renaming("base.acd", 5, 10, "FN11").at("result").at("changes");
    EXPECT_EQ(changes.size(), 3U);
    EXPECT_EQ(applied(SMALL.at("base.acd"), changes.at(editor.uri("base.acd"))),
              "DEVICE_SUPPORTED = base,finch,spi\n"
              "PROGRAM_OPTION_PACKAGE = FN11P48,base,finch,spi\n"
              "BS = outputs,PARALLEL,USB2:families,finch\n"
              "SS = outputs,PARALLEL:families,finch\n"
              "NOT_SUPPORTED_PART_IN_MODE = SS_FN11_P48\n"
              "IDCODE = FN11,0x00000011:FN20,0x00000021\n");
    EXPECT_EQ(applied(SMALL.at("spi.acd"), changes.at(editor.uri("spi.acd"))).find("FN10"),
              std::string::npos);
    EXPECT_EQ(changes.at(editor.uri("finch.acd")).size(), 1U);
    const Json family = editor.renaming("base.acd", 0, 25, "wren").at("result").at("documentChanges");
    EXPECT_EQ(applied(SMALL.at("base.acd"), family.at(0).at("edits")).find("finch"), std::string::npos);
    EXPECT_EQ(family.back().at("kind"), "rename");
    EXPECT_EQ(family.back().at("newUri"), editor.uri("wren.acd"));
}

TEST(LspNames, AreNotRenamedToWhatTheyCannotBe) {
    Small editor("base.acd");
    for (const char* const name : {"", "A B", "A,B", "A:B", "A]", "A_B", "FN20", "fn20", "finch", "FLA",
                                   "../x", "fn10", "spi", "ABCDEFGHIJKLMNOP"}) {
        EXPECT_EQ(editor.renaming("base.acd", 5, 10, name).at("error").at("code"), -32803) << name;
    }
    EXPECT_TRUE(editor.renaming("base.acd", 5, 10, "FN11").contains("result"));
    EXPECT_THAT(editor.renaming("base.acd", 5, 10, "fn11").at("error").at("message").get<std::string>(),
                HasSubstr("in lower case, all others in upper case: \"FN11\""));
    // Not base, not a package, not a word; and no family where the editor cannot rename files.
    EXPECT_TRUE(editor.renaming("base.acd", 0, 20, "other").contains("error"));
    EXPECT_TRUE(editor.renaming("base.acd", 1, 31, "P49").contains("error"));
    EXPECT_TRUE(editor.renaming("base.acd", 2, 15, "X").contains("error"));
    EXPECT_TRUE(editor.renaming("base.acd", 0, 25, "wren").contains("error"));
    // Nor where a line ends within the name.
    editor.replaceText("base.acd", "IDCODE = FN\\\n10,0x00000011\n");
    EXPECT_THAT(editor.renaming("base.acd", 0, 10, "FN11").at("error").at("message").get<std::string>(),
                HasSubstr("base.acd:1: the name is continued in the next line"));
    editor.replaceText("base.acd", SMALL.at("base.acd"));
    EXPECT_EQ(editor.ask("textDocument/prepareRename", editor.at("base.acd", 5, 10)).at("placeholder"),
              "FN10");
    EXPECT_TRUE(editor.ask("textDocument/prepareRename", editor.at("base.acd", 2, 15)).is_null());
}

TEST(LspSymbols, AreSectionsWithTheirKeys) {
    Small editor("finch.acd");
    const Json symbols = editor.ask("textDocument/documentSymbol", editor.document("finch.acd"));
    ASSERT_EQ(symbols.size(), 3U);
    EXPECT_EQ(symbols.at(0).at("name"), "OPERATION");
    EXPECT_EQ(symbols.at(0).at("range").at("end").at("line"), 1);
    EXPECT_EQ(symbols.at(2).at("name"), "FN20");
    EXPECT_EQ(symbols.at(2).at("children").at(0).at("name"), "PROPERTY");
    EXPECT_EQ(symbols.at(1).at("range").at("end").at("line"), 3);
    const Json found = editor.ask("workspace/symbol", {{"query", "fn2"}});
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found.at(0).at("name"), "FN20");
}

TEST(LspFormatting, IsTheCanonicalForm) {
    Small editor("finch.acd");
    const std::string text = "# kept\r\nOPERATION=PROGRAM,Bscan,USB2:VERIFY,Bscan,USB2\r\n[FN10]\r\n[FN20]";
    editor.replaceText("finch.acd", text);
    const Json edits = editor.ask("textDocument/formatting", editor.document("finch.acd"));
    EXPECT_EQ(applied(text, edits), "# kept\r\nOPERATION = PROGRAM,Bscan,USB2: \\\r\n"
                                    "            VERIFY,Bscan,USB2\r\n\r\n[FN10]\r\n[FN20]\r\n");
    editor.replaceText("finch.acd", applied(text, edits));
    EXPECT_TRUE(editor.ask("textDocument/formatting", editor.document("finch.acd")).empty());
}
