#include "Members.h"

// The "PROPERTY" and "PROPERTIES" entries: which values they leave in the property table.

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using testing::SizeIs;
using testing::UnorderedElementsAre;

namespace {

/// A manager with one family that has the given entries.
struct PropertySession : ManagerFixture {
    explicit PropertySession(const std::string& entries)
        : ManagerFixture({{"base.acd", "DEVICE_SUPPORTED = kestrel\nPROGRAM_OPTION_PACKAGE = kestrel\n"},
                          {"kestrel.acd", entries}}) {}

    auto load(bool exceptions = true) {
        (*this)->setExceptions(exceptions);
        members().loadDeviceData("kestrel", {});
        return lists(members().m_deviceProperties);
    }
    int raises() {
        return raisedLine<DataMismatchException>([&] { (void)load(); });
    }
};

TEST(PropertyEntries, EachGivesOneValue) {
    PropertySession session("PROPERTY = VENDOR,Korvel:IRLENGTH,6\n");
    EXPECT_THAT(session.load(), UnorderedElementsAre(Pair("kestrel_VENDOR", ElementsAre("Korvel")),
                                                     Pair("kestrel_IRLENGTH", ElementsAre("6"))));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PropertyEntries, NamesAndValuesAreTakenExactlyAsStored) {
    PropertySession session("PROPERTY = Vendor, Korvel :vendor,%s:VENDOR,\xff\n");
    EXPECT_THAT(session.load(), UnorderedElementsAre(Pair("kestrel_Vendor", ElementsAre(" Korvel ")),
                                                     Pair("kestrel_vendor", ElementsAre("%s")),
                                                     Pair("kestrel_VENDOR", ElementsAre("\xff"))));
}

TEST(PropertyEntries, FieldsBehindTheValueAreNotRead) {
    PropertySession session("PROPERTY = A,1,2,3\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", ElementsAre("1"))));
}

TEST(PropertyEntries, LaterEntryReplacesTheEarlier) {
    PropertySession session("PROPERTY = A,1:A,2\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", ElementsAre("2"))));
}

TEST(PropertyEntries, MissingValueRaises) {
    PropertySession session("PROPERTY = A,1:B:C,3\n");
    EXPECT_EQ(session.raises(), 1011);
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PropertyEntries, MissingValueIsTheEmptyTextWhileExceptionsAreOff) {
    PropertySession session("PROPERTY = A,1:B:C,3\n");
    EXPECT_THAT(session.load(false),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("1")), Pair("kestrel_B", ElementsAre("")),
                                     Pair("kestrel_C", ElementsAre("3"))));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PropertyEntries, EmptyValueIsAValue) {
    PropertySession session("PROPERTY = A,\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", ElementsAre(""))));
}

TEST(PropertyEntries, EmptyEntryIsAPropertyWithoutNameAndValue) {
    PropertySession session("PROPERTY = A,1::B,2\n");
    EXPECT_THAT(session.load(false),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("1")), Pair("kestrel_", ElementsAre("")),
                                     Pair("kestrel_B", ElementsAre("2"))));
}

TEST(PropertyEntries, MissingOrEmptyEntryGivesNothing) {
    for (const char* entry : {"", "PROPERTY =\nPROPERTIES =\n"}) {
        PropertySession session(entry);
        EXPECT_THAT(session.load(), IsEmpty());
        EXPECT_THAT(session.messages(), IsEmpty());
    }
}

TEST(PropertyEntries, BehindIndex32767DoNotExist) {
    PropertySession session("PROPERTY = " + numberedList("p", 40000, ",1:") + ",1\n");
    const auto properties = session.load();
    EXPECT_THAT(properties, SizeIs(32768));
    EXPECT_EQ(properties.count("kestrel_p32767"), 1U);
    EXPECT_EQ(properties.count("kestrel_p32768"), 0U);
}

TEST(PropertiesEntries, GiveAsManyValuesAsTheySay) {
    PropertySession session("PROPERTIES = A,2,y,x:B,1,z:C,0\n");
    EXPECT_THAT(session.load(),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("x", "y")),
                                     Pair("kestrel_B", ElementsAre("z")), Pair("kestrel_C", IsEmpty())));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PropertiesEntries, ValuesBehindTheCountAreNotRead) {
    PropertySession session("PROPERTIES = A,1,x,y,z\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", ElementsAre("x"))));
}

TEST(PropertiesEntries, ValueListedTwiceCountsOnce) {
    PropertySession session("PROPERTIES = A,4,x,X,x,\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", ElementsAre("", "X", "x"))));
}

TEST(PropertiesEntries, CountIsReadAsADecimalNumber) {
    PropertySession session("PROPERTIES = A, 2x,a,b,c:B,+1,a,b:C,two,a:D,-5,a:E,,a:F,0x2,a,b\n");
    EXPECT_THAT(session.load(),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("a", "b")),
                                     Pair("kestrel_B", ElementsAre("a")), Pair("kestrel_C", IsEmpty()),
                                     Pair("kestrel_D", IsEmpty()), Pair("kestrel_E", IsEmpty()),
                                     Pair("kestrel_F", IsEmpty())));
}

TEST(PropertiesEntries, MissingCountIs0) {
    PropertySession session("PROPERTIES = A\n");
    EXPECT_THAT(session.load(), ElementsAre(Pair("kestrel_A", IsEmpty())));
}

TEST(PropertiesEntries, MissingValueRaises) {
    PropertySession session("PROPERTIES = A,1,x:B,3,x,y:C,1,z\n");
    EXPECT_EQ(session.raises(), 1051);
    EXPECT_THAT(session.messages(), IsEmpty());
    const auto properties = lists(session.members().m_deviceProperties);
    EXPECT_THAT(properties.at("kestrel_A"), ElementsAre("x"));
    EXPECT_EQ(properties.count("kestrel_C"), 0U);
}

TEST(PropertiesEntries, MissingValueIsTheEmptyTextWhileExceptionsAreOff) {
    PropertySession session("PROPERTIES = A,4,x,y:B,1,z\n");
    EXPECT_THAT(session.load(false), UnorderedElementsAre(Pair("kestrel_A", ElementsAre("", "x", "y")),
                                                          Pair("kestrel_B", ElementsAre("z"))));
    EXPECT_THAT(session.messages(), IsEmpty());
}

TEST(PropertiesEntries, HugeCountCostsNoMoreThanTheValues) {
    for (const char* count : {"2147483647", "99999999999999999999"}) {
        PropertySession session(std::string("PROPERTIES = A,") + count + ",x,y\n");
        EXPECT_THAT(session.load(false), ElementsAre(Pair("kestrel_A", ElementsAre("", "x", "y"))));
    }
    PropertySession session("PROPERTIES = A,2147483647,x,y\n");
    EXPECT_EQ(session.raises(), 1051);
}

TEST(PropertiesEntries, ValuesBehindIndex32767DoNotExist) {
    PropertySession session("PROPERTIES = A,32766," + numberedList("v", 40000) + "\n");
    const auto properties = session.load();
    EXPECT_THAT(properties.at("kestrel_A"), SizeIs(32766));
}

TEST(PropertiesEntries, CountOverTheLastIndexRaises) {
    PropertySession session("PROPERTIES = A,32767," + numberedList("v", 40000) + "\n");
    EXPECT_EQ(session.raises(), 1051);
}

TEST(PropertiesEntries, CountOverTheLastIndexAddsTheEmptyTextWhileExceptionsAreOff) {
    PropertySession session("PROPERTIES = A,40000," + numberedList("v", 40000) + "\n");
    const auto properties = session.load(false);
    EXPECT_THAT(properties.at("kestrel_A"), SizeIs(32767));
    EXPECT_EQ(properties.at("kestrel_A").front(), "");
}

TEST(PropertiesEntries, ReplaceThoseOfTheSameNameWhole) {
    PropertySession session("PROPERTY = A,1:B,1\nPROPERTIES = A,2,x,y:A,1,z:B,0\n");
    EXPECT_THAT(session.load(),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("z")), Pair("kestrel_B", IsEmpty())));
}

TEST(PropertyOwners, KeepTheirPropertiesApart) {
    ManagerFixture session(
        {{"base.acd", "DEVICE_SUPPORTED = kestrel\nPROGRAM_OPTION_PACKAGE = kestrel\n"},
         {"kestrel.acd", "PROPERTY = A,1\n[KS50]\nPROPERTY = A,2\n[KS100]\nPROPERTY = A,3\n"}});
    session.members().loadDeviceData("KS50", {});
    session.members().loadDeviceData("KS100", {});
    EXPECT_THAT(lists(session.members().m_deviceProperties),
                UnorderedElementsAre(Pair("kestrel_A", ElementsAre("1")), Pair("KS50_A", ElementsAre("2")),
                                     Pair("KS100_A", ElementsAre("3"))));
}

TEST(PropertyOwners, JoinedToTheSameKeyShareAnEntry) {
    ManagerFixture session({{"base.acd", "DEVICE_SUPPORTED = a\nPROGRAM_OPTION_PACKAGE = a\n"},
                            {"a.acd", "PROPERTY = b_c,1\n"},
                            {"a_b.acd", "PROPERTY = c,2\n"}});
    session->setExceptions(false);
    session.members().loadDeviceData("a", {});
    EXPECT_THAT(lists(session.members().m_deviceProperties), ElementsAre(Pair("a_b_c", ElementsAre("1"))));
    session.members().loadDeviceData("a_b", {});
    EXPECT_THAT(lists(session.members().m_deviceProperties), ElementsAre(Pair("a_b_c", ElementsAre("2"))));
}

TEST(PropertyOwners, ManyKeepTheirTable) {
    PropertySession session("PROPERTY = " + numberedList("p", 1000, ",1:") + ",1\n");
    EXPECT_THAT(session.load(), SizeIs(1000));
    EXPECT_GE(session.members().m_deviceProperties.bucketCount(), 1000U);
}

} // namespace
