// The properties as the engine and its clients declare them, beside the files that document them.

#include "services/engine/Interface.h"

#include <array>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <pugixml.hpp>

namespace {

using namespace quorl::engine;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// Name, type and access of each property, in order.
using Declared = std::vector<std::array<std::string, 3>>;

Declared documented(const std::string& interface) {
    pugi::xml_document document;
    const auto path = DESCRIPTIONS "/" + interface + ".xml";
    if (!document.load_file(path.c_str())) {
        throw std::runtime_error("cannot read " + path);
    }
    const auto found =
        document.child("node").find_child_by_attribute("interface", "name", interface.c_str());
    Declared properties;
    for (const auto& property : found.children("property")) {
        properties.push_back({property.attribute("name").value(),
                              property.attribute("type").value(),
                              property.attribute("access").value()});
    }
    return properties;
}

template <class State>
Declared inTheTable() {
    Declared properties;
    forEachProperty<State>([&]<class T>(const Property<State, T>& property) {
        properties.push_back({property.name, sdbus::signature_of<OnBus<T>>::str(),
                              property.access == Access::ReadWrite ? "readwrite" : "read"});
    });
    return properties;
}

template <class State>
class Properties : public ::testing::Test {};

using States = ::testing::Types<EngineStatus, WearableStatus, SessionState, TaskState>;
TYPED_TEST_SUITE(Properties, States);

TYPED_TEST(Properties, AreThoseOfTheDocumentedInterface) {
    EXPECT_EQ(inTheTable<TypeParam>(), documented(Interface<TypeParam>::name));
}

TYPED_TEST(Properties, AreToldOnlyWhereTheyDiffer) {
    EXPECT_THAT(changedProperties(TypeParam(), TypeParam()), IsEmpty());
}

TEST(ChangedProperties, AreToldByTheirNames) {
    const WearableStatus before{.name = "Velora", .capacity = 4};
    auto now = before;
    now.name = "Another";
    now.songs = 1;

    EXPECT_THAT(changedProperties(before, now), ElementsAre("Name", "Songs"));
}

TEST(ValueOf, IsTheMemberThatBelongsToTheName) {
    EXPECT_EQ(valueOf<"Available">(WearableStatus{.capacity = 4, .available = 3}), 3);
    EXPECT_EQ(valueOf<"Progress">(TaskState{.progress = Fraction(0.5)}), 0.5);
}

TEST(Speakable, AreTextsOfEveryKind) {
    const EngineStatus status{.statusCode = "other",
                              .statusArguments = {"\xFF"},
                              .leftOut = {LeftOutItem("b\xFF.mp3", "missing")},
                              .leftOutCount = 1};

    const auto spoken = speakable(status);

    EXPECT_THAT(spoken.statusArguments, ElementsAre("\uFFFD"));
    EXPECT_THAT(spoken.leftOut, ElementsAre(LeftOutItem("b\uFFFD.mp3", "missing")));
    EXPECT_EQ(spoken.leftOutCount, 1);
}

TEST(Update, TakesWhatIsKnownAndOfTheRightType) {
    TaskState task{.groupingKey = "before", .totalItemCount = 1};

    update(task, {{"GroupingKey", sdbus::Variant(true)},
                  {"TotalItemCount", sdbus::Variant(std::uint64_t{7})},
                  {"CompletedItemCount", sdbus::Variant(std::int32_t{5})},
                  {"Running", sdbus::Variant(std::string("yes"))},
                  {"Progress", sdbus::Variant(2.5)},
                  {"Weather", sdbus::Variant("fine")}});

    EXPECT_EQ(task,
              (TaskState{.groupingKey = "before", .totalItemCount = 7, .progress = Fraction(1)}));
}

} // namespace
