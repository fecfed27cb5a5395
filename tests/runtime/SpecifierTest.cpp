// A row by itself: what it was made of, and whom its value is asked from and given to.

#include <gmock/gmock.h>

#include "platform/PreferencesList.h"
#include "tests/support/TestHost.h"

namespace {

using quorl::tests::TestHost;
using testing::IsEmpty;
using testing::Pair;

class Target : public NSObject {
  public:
    std::optional<std::string> value(const std::shared_ptr<PSSpecifier>& row) {
        return row->name();
    }

    void setValue(const std::shared_ptr<NSObject>& value, const std::shared_ptr<PSSpecifier>& row) {
        given.emplace_back(value, row);
    }

    std::vector<std::pair<std::shared_ptr<NSObject>, std::shared_ptr<PSSpecifier>>> given;
};

class Detail : public NSObject {};

class Edit : public NSObject {};

const auto getter = PSGetter::of<&Target::value>("value:");
const auto setter = PSSetter::of<&Target::setValue>("setValue:specifier:");

class Specifiers : public testing::Test {
  protected:
    [[nodiscard]] std::shared_ptr<PSSpecifier> row(std::optional<PSSetter> set,
                                                   std::optional<PSGetter> get) const {
        return PSSpecifier::preferenceSpecifierNamed_target_set_get_detail_cell_edit(
            "Row", target_, set, get, Class::of<Detail>(), PSCellType::Switch, Class::of<Edit>());
    }

    std::shared_ptr<TestHost> host_ = TestHost::installed();
    std::shared_ptr<Target> target_ = create<Target>();
};

TEST_F(Specifiers, HaveWhatTheyWereMadeOf) {
    const auto made = row(setter, getter);

    EXPECT_EQ(made->name(), "Row");
    EXPECT_EQ(made->target(), target_);
    EXPECT_EQ(made->setter()->name(), "setValue:specifier:");
    EXPECT_EQ(made->getter()->name(), "value:");
    EXPECT_TRUE(made->detailControllerClass() == Class::of<Detail>());
    EXPECT_EQ(made->cellType(), PSCellType::Switch);
    EXPECT_TRUE(made->editPaneClass() == Class::of<Edit>());
}

TEST_F(Specifiers, GiveANewValueToTheSetterOfTheirTarget) {
    const auto made = row(setter, getter);
    const auto value = NSNumber::numberWithBool(true);

    made->setValue(value);
    made->setValue(nullptr);

    EXPECT_THAT(target_->given, testing::ElementsAre(Pair(value, made), Pair(nullptr, made)));
    EXPECT_EQ(made->value(), "Row");
}

TEST_F(Specifiers, WithoutSetterAndGetterGiveAndTakeNothing) {
    const auto made = row(std::nullopt, std::nullopt);

    made->setValue(NSNumber::numberWithBool(true));

    EXPECT_THAT(target_->given, IsEmpty());
    EXPECT_EQ(made->value(), std::nullopt);
}

TEST_F(Specifiers, WhoseTargetIsGoneGiveAndTakeNothing) {
    const auto made = row(setter, getter);
    target_ = nullptr;

    made->setValue(NSNumber::numberWithBool(true));

    EXPECT_EQ(made->target(), nullptr);
    EXPECT_EQ(made->value(), std::nullopt);
}

TEST_F(Specifiers, KeepPropertiesUntilTheyAreTakenAway) {
    const auto made = row(setter, getter);

    made->setProperty_forKey("below", PSFooterTextGroupKey);
    EXPECT_EQ(made->propertyForKey(PSFooterTextGroupKey), "below");
    EXPECT_EQ(made->propertyForKey("other"), std::nullopt);

    made->setProperty_forKey(std::nullopt, PSFooterTextGroupKey);
    EXPECT_EQ(made->propertyForKey(PSFooterTextGroupKey), std::nullopt);
}

TEST(SpecifiersWithoutAHost, KeepPropertiesToo) {
    const auto made = create<PSSpecifier>();
    made->setProperty_forKey("below", PSFooterTextGroupKey);
    EXPECT_EQ(made->propertyForKey(PSFooterTextGroupKey), "below");
}

TEST(SwitchValues, AreThoseThatPanesGive) {
    EXPECT_EQ(PSSwitchOnValue, "on");
    EXPECT_EQ(PSSwitchOffValue, "off");
}

} // namespace
