#include "quorl-script/output/Json.h"

#include <limits>
#include <optional>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

namespace quorl {

namespace {

TEST(JsonText, OfPlainValuesIsWhatJsonHasForThem) {
    EXPECT_EQ(Json(nullptr).text(), "null");
    EXPECT_EQ(Json(true).text(), "true");
    EXPECT_EQ(Json(false).text(), "false");
    EXPECT_EQ(Json(-7).text(), "-7");
    EXPECT_EQ(Json(std::numeric_limits<std::uint64_t>::max()).text(), "18446744073709551615");
    EXPECT_EQ(Json("a text").text(), R"("a text")");
    EXPECT_EQ(Json(std::optional<std::string>("there")).text(), R"("there")");
    EXPECT_EQ(Json(std::optional<std::string>()).text(), "null");
}

TEST(JsonText, OfANumberIsTheShortestThatStandsForIt) {
    EXPECT_EQ(Json(0.1).text(), "0.1");
    EXPECT_EQ(Json(1.0).text(), "1.0");
    EXPECT_EQ(Json(0.1F).text(), "0.10000000149011612");
    EXPECT_EQ(Json(std::numeric_limits<double>::infinity()).text(), "null");
}

TEST(JsonText, EscapesWhatHasToBe) {
    EXPECT_EQ(Json("").text(), R"("")");
    EXPECT_EQ(Json(" ~").text(), R"(" ~")");
    EXPECT_EQ(Json(R"(a "quoted" \ text)").text(), R"("a \"quoted\" \\ text")");
    EXPECT_EQ(Json("line\nnext\x1F\x7F").text(), "\"line\\nnext\\u001f\x7F\"");
    EXPECT_EQ(Json("Sync Pending…").text(), "\"Sync Pending…\"");
}

TEST(JsonText, OfAnyByteIsAText) {
    for (int byte = 0; byte < 256; ++byte) {
        const std::string text{'a', static_cast<char>(byte), 'b'};
        const auto read = nlohmann::json::parse(Json(text).text());
        EXPECT_EQ(read, byte < 0x80 ? text : "a\uFFFDb") << byte;
    }
}

TEST(JsonLists, KeepTheOrderOfWhatIsAdded) {
    EXPECT_EQ(JsonList().text(), "[]");
    EXPECT_EQ(JsonList().add(1).text(), "[1]");
    EXPECT_EQ(JsonList().add(JsonList()).add("x").add(JsonObject().set("y", 2)).text(),
              R"([[],"x",{"y":2}])");
}

TEST(JsonObjects, KeepTheOrderOfTheirMembers) {
    EXPECT_EQ(JsonObject().text(), "{}");
    EXPECT_EQ(JsonObject().set("b", 1).set("a", nullptr).text(), R"({"b":1,"a":null})");
}

TEST(JsonObjects, TakeTheMembersOfOthers) {
    const auto other = JsonObject().set("b", 2).set("c", 3);
    EXPECT_EQ(JsonObject().set("a", 1).setAll(other).text(), R"({"a":1,"b":2,"c":3})");
    EXPECT_EQ(JsonObject().setAll(other).text(), other.text());
    EXPECT_EQ(JsonObject().set("a", 1).setAll({}).text(), R"({"a":1})");
}

} // namespace

} // namespace quorl
