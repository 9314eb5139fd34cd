// Texts that a rule must not find, though they differ little from those that it does.
#include "LintFixtures.h"

#include <gmock/gmock.h>

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

/// A database of one family with these lists and sections.
Files database(const std::string& supported, const std::string& optionPackages, const std::string& base,
               const std::string& family) {
    return {{"base.acd", "DEVICE_SUPPORTED = base,kestrel" + supported +
                             "\nPROGRAM_OPTION_PACKAGE = base,kestrel" + optionPackages + "\n" + base +
                             "IDCODE = KS50,0xX4104FB7\n"},
            {"kestrel.acd", family}};
}

Files flashes(const std::string& text) {
    Files files = database(",spi", ",spi", "", "[KS50]\n");
    files["spi.acd"] = text;
    return files;
}

/// A family whose devices KS0, KS1, ... have one of these packages each.
Files packages(const std::vector<std::string>& names) {
    Files files{
        {"base.acd", "DEVICE_SUPPORTED = base,kestrel\nPROGRAM_OPTION_PACKAGE = base,kestrel\nIDCODE = "},
        {"kestrel.acd", ""}};
    for (std::size_t i = 0; i < names.size(); ++i) {
        const std::string number = std::to_string(i);
        files["base.acd"] += (i == 0 ? "KS" : ":KS") + number + ",0x000" + number + "0001";
        files["kestrel.acd"] += "[KS" + number + "]\nPROPERTIES = PACKAGES,1," + names[i] + "\n";
    }
    files["base.acd"] += "\n";
    return files;
}

} // namespace

TEST(NearMisses, OptionTablesOfPackages) { // B107
    const std::string section = "[KS50]\nOPERATION = PROGRAM,Bscan,USB2\nPROPERTIES = PACKAGES,1,TQ144\n";
    EXPECT_THAT(codes(database(",KS50", ",KS50,KS50TQ144", "", section)), ElementsAre("B107"));
    EXPECT_THAT(codes(database(",KS50", ",KS50", "", section)), IsEmpty());
    EXPECT_THAT(codes(database("", ",KS50,KS50TQ144", "", "[KS50]\nPROPERTIES = PACKAGES,1,TQ144\n")),
                IsEmpty());
    EXPECT_THAT(codes(database("", ",KS50TQ144", "", "[KS50]\n")), IsEmpty());
}

TEST(NearMisses, DevicesWithTablesOfTheirOwn) { // B108
    EXPECT_THAT(codes(database(",KS50", ",KS50", "", "[KS50]\n")), ElementsAre("B108"));
    EXPECT_THAT(codes(database(",KS50", ",KS50", "", "[KS50]\nBSDL_OPERATION = BYPASS,USB2\n")), IsEmpty());
    EXPECT_THAT(codes(database(",KS50", ",KS50", "", "[KS50]\nOPERATION = PROGRAM,Bscan,USB2\n")), IsEmpty());
    // A device without operations.
    EXPECT_THAT(codes(database(",KS50", ",KS50", "", "[KS50]\nOPERATION =\n")), IsEmpty());
}

TEST(NearMisses, PartsOfFamiliesUnderTheirMode) { // M205
    const std::string part = "NOT_SUPPORTED_PART_IN_MODE = SM_KS50_TQ144\n";
    const std::string table = "OPERATION = PROGRAM,Smap,USB2\n[KS50]\nPROPERTIES = PACKAGES,1,TQ144\n";
    EXPECT_THAT(codes(database("", "", "SM = outputs,USB2:families\n" + part, "[KS50]\n")),
                ElementsAre("M205"));
    EXPECT_THAT(codes(database("", "", "SM = outputs,USB2:families,kestrel\n" + part, table)), IsEmpty());
    // Without its key the mode accepts no family at all, which is the one finding.
    EXPECT_THAT(codes(database("", "", "BS = outputs,USB2:families,kestrel\n" + part,
                               "OPERATION = PROGRAM,Bscan,USB2:PROGRAM,Smap,USB2\n[KS50]\n")),
                ElementsAre("M105"));
    Files files = flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\nMRS1M_PROPERTY = DENSITY,1\n"
                          "OPERATION = PROGRAM,DP770,USB2\n");
    files["base.acd"] += "DP770 = outputs,USB2:families,spi\nNOT_SUPPORTED_PART_IN_MODE = DP770_MRS1M_SO8\n";
    EXPECT_THAT(codes(files), IsEmpty());
}

TEST(NearMisses, FlashesWithProperties) { // S110
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\n")), ElementsAre("S110"));
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\nMRS1M_PROPERTY =\n")), IsEmpty());
    // In a class that gives none either.
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = ST1\nST1_DEVICES = MRS1M\n")), IsEmpty());
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\nST1_DEVICES = MRS1M\n")), IsEmpty());
}

TEST(NearMisses, PropertiesOfClasses) { // S111
    const std::string flash = "MRS1M_PROPERTY = DENSITY,1\n";
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\nNV1_PROPERTY = A,1\n" + flash)),
                ElementsAre("S111"));
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = ST1\nST1_DEVICES = MRS1M\nST1_PROPERTY = A,1\n" + flash)),
                IsEmpty());
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = NV1\nNV1_DEVICES = MRS1M\n" + flash)), IsEmpty());
}

TEST(NearMisses, PackagesThatDifferInDigits) { // C104
    EXPECT_THAT(codes(packages({"TQ100", "TQ100", "TQ1O0"})), ElementsAre("C104"));
    EXPECT_THAT(codes(packages({"TQ100", "TQ100", "TQ101"})), IsEmpty());
    EXPECT_THAT(codes(packages({"TQ100", "TQ100", "TQ10"})), IsEmpty());
    EXPECT_THAT(codes(packages({"SO8", "SO8", "BG56"})), IsEmpty());
    // Both are common, so both are meant.
    EXPECT_THAT(codes(packages({"FB8", "FB8", "FB8", "FB8", "F88", "F88", "F88"})), IsEmpty());
}

TEST(NearMisses, CarriageReturnsAtLineEnds) { // L113
    EXPECT_THAT(codes(withFamily("[KS50]\nPROPERTY = A,1\rB\n")), ElementsAre("L113"));
    EXPECT_THAT(codes(withFamily("# a\r\n[KS50]\r\nPROPERTY = A,1: \\\r\n  B,2\r\n\r\n")), IsEmpty());
    EXPECT_THAT(codes(withFamily("[KS50]\r\nPROPERTY = A,1\r\n#")), IsEmpty());
}

TEST(NearMisses, KeysOfOtherFiles) { // K101
    EXPECT_THAT(lint(withFamily("IDCODE = KS50,0xX4104FB7\n[KS50]\n")).output,
                HasSubstr("the key \"IDCODE\" is not read here; it belongs to base.acd"));
    EXPECT_THAT(lint(withFamily("DEVICE_FAMILY = ST1\n[KS50]\n")).output,
                HasSubstr("the key \"DEVICE_FAMILY\" is not read here; it belongs to spi.acd"));
}

TEST(NearMisses, OperatorsWithBlanks) { // F107
    constexpr const char* HINT = "1 can be fixed by --fix";
    EXPECT_THAT(lint(withFamily("PROPERTY =+ A,1\n[KS50]\n")).error, HasSubstr(HINT));
    // Here the sign may be meant as a part of the value.
    const ProcessResult separated = lint(withFamily("PROPERTY = + A,1\n[KS50]\n"));
    EXPECT_THAT(separated.error, testing::AllOf(HasSubstr("F107: 1"), testing::Not(HasSubstr(HINT))));
}

TEST(NearMisses, EmptyNamesOfFlashFamilies) { // S101
    EXPECT_THAT(codes(flashes("DEVICE_FAMILY = ST1,,ST2\nST1_DEVICES = MRS1M\nST2_DEVICES = MRS2M\n"
                              "MRS1M_PROPERTY = DENSITY,1\nMRS2M_PROPERTY = DENSITY,2\n")),
                ElementsAre("F103"));
}
