// What an application writes with the host's headers. Compiled in many ways: both standards, both compilers, both standard
// libraries, without exceptions, and among macros that applications define.
#include <tarvik/ltptstr.h>

#include <AcdLines.h>
#include <AcdReader.h>
#include <AcdStore.h>
#include <AcdText.h>
#include <PM_DEVKEY.h>
#include <PicConfig.h>
#include <Port_MsgManData.h>
#include <StringBase.h>
#include <TarvikException.h>
#include <TarvikSmokeMgr.h>
#include <UT_STR.h>

#include <map>
#include <ostream>
#include <set>
#include <string>
#include <string_view>
#include <unordered_set>

using TextSet = std::set<StringBase, ltptstr>;
using TextMap = std::map<StringBase, StringBase, ltptstr>;

bool areFound(const TextSet& set, const TextMap& map, const char* text, const std::string& string,
              std::string_view view, const StringBase& base);
bool areFound(const TextSet& set, const TextMap& map, const char* text, const std::string& string,
              std::string_view view, const StringBase& base) {
    return set.count("TRUE") + set.count(text) + set.count(string) + set.count(view) + set.count(base) != 0 ||
           map.find("KS50") != map.end() || map.find(text) != map.end() || map.find(string) != map.end() ||
           map.find(view) != map.end() || map.find(base) != map.end() || map.count("KS50") != 0;
}

// Comparisons of other texts stay those of the standard library.
bool areComparedWithoutUs(const char* text, const std::string& string, std::string_view view);
bool areComparedWithoutUs(const char* text, const std::string& string, std::string_view view) {
    return view == text || text == view || view == "KS50" || string == text || view != text || view < text ||
           string < text;
}

bool areCompared(const StringBase& base, const char* text, const std::string& string, std::string_view view);
bool areCompared(const StringBase& base, const char* text, const std::string& string, std::string_view view) {
    const bool areEqual = base == "KS50" || base == text || base == string || base == view || base == base ||
                          "KS50" == base || text == base || string == base || view == base;
    const bool differ = base != "KS50" || base != text || base != string || base != view || "KS50" != base ||
                        text != base || string != base || view != base;
    const bool areOrdered = base < "KS50" || base < text || base < string || base < view || "KS50" < base ||
                            text < base || string < base || view < base;
    return areEqual || differ || areOrdered;
}

void write(std::ostream& stream, const std::unordered_set<StringBase>& texts);
void write(std::ostream& stream, const std::unordered_set<StringBase>& texts) {
    for (const StringBase& text : texts) {
        stream << text << std::string_view(text).size() << StringBase(std::string_view("x"));
    }
}

bool isTrace(const Port_MsgManData::Message& message);
bool isTrace(const Port_MsgManData::Message& message) {
    return message.channel == Port_MsgManData::Channel::TRACE;
}
