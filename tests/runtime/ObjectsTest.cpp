#include <gtest/gtest.h>

#include "platform/Foundation.h"

namespace {

class Readable : public NSObject {
  public:
    [[nodiscard]] bool initWithText(std::string text) {
        text_ = std::move(text);
        return NSObject::init() && !text_.empty();
    }

    [[nodiscard]] const std::string& text() const { return text_; }

  private:
    std::string text_;
};

class NeverThere : public NSObject {
  public:
    [[nodiscard]] bool init() override { return false; }
};

class HoldsItselfWhileBeginning : public NSObject {
  public:
    [[nodiscard]] bool init() override {
        self_ = weak(this);
        return NSObject::init() && strong(this).get() == this;
    }

    [[nodiscard]] bool knowsItself() const { return self_.lock().get() == this; }

  private:
    std::weak_ptr<HoldsItselfWhileBeginning> self_;
};

/// Tells that it is gone, and looks back at its owner while it goes.
class Companion : public NSObject {
  public:
    Companion() = default;

    ~Companion() override {
        if (gone) {
            *gone = true;
        }
        if (replaces) {
            objc_setAssociatedObject(*replaces, this, nullptr, OBJC_ASSOCIATION_RETAIN_NONATOMIC);
        }
    }

    bool* gone = nullptr;
    NSObject* replaces = nullptr;
};

TEST(Objects, AreThereOnlyWhenTheirInitialiserSaysSo) {
    EXPECT_EQ(create<NeverThere>(), nullptr);
    EXPECT_EQ(Class::of<NeverThere>().create(), nullptr);
    EXPECT_EQ(create<Readable>(&Readable::initWithText, ""), nullptr);

    const auto object = create<Readable>(&Readable::initWithText, "a text");
    ASSERT_NE(object, nullptr);
    EXPECT_EQ(object->text(), "a text");
}

TEST(Objects, CanBeHeldWithinTheirOwnInitialiser) {
    const auto object = create<HoldsItselfWhileBeginning>();

    ASSERT_NE(object, nullptr);
    EXPECT_TRUE(object->knowsItself());
}

TEST(Objects, WithoutValuesAreEqualToThemselvesOnly) {
    const auto one = create<NSObject>();
    const auto other = create<NSObject>();

    EXPECT_TRUE(one->isEqual(one.get()));
    EXPECT_FALSE(one->isEqual(other.get()));
    EXPECT_FALSE(one->isEqual(nullptr));
}

TEST(Classes, MakeObjectsOfTheirOwnAndAreKnownByName) {
    const Class cls = Class::of<HoldsItselfWhileBeginning>();

    const auto object = cls.create();

    ASSERT_NE(object, nullptr);
    EXPECT_TRUE(Class::ofObject(*object) == cls);
    EXPECT_FALSE(Class::ofObject(*object) == Class::of<NSObject>());
    EXPECT_EQ(Class::of<NSObject>().name(), "NSObject");
}

TEST(Classes, OfAnObjectMakeNoOtherOne) {
    const auto object = create<NSObject>();

    EXPECT_EQ(Class::ofObject(*object).create(), nullptr);
}

class AssociatedObjects : public testing::Test {
  protected:
    static std::shared_ptr<Companion> companion(bool& gone) {
        auto made = create<Companion>();
        made->gone = &gone;
        return made;
    }

    static void attach(NSObject& owner, const void* key, std::shared_ptr<NSObject> value) {
        objc_setAssociatedObject(owner, key, std::move(value), OBJC_ASSOCIATION_RETAIN_NONATOMIC);
    }

    std::shared_ptr<NSObject> owner_ = create<NSObject>();
    const int key_ = 0;
    const int otherKey_ = 0;
};

// There is no room for another way to hold them, as none would be heeded.
static_assert(OBJC_ASSOCIATION_RETAIN_NONATOMIC == 1);
static_assert(std::is_empty_v<NSAssociationPolicy>);

TEST_F(AssociatedObjects, AreNoneAtFirst) {
    EXPECT_EQ(objc_getAssociatedObject(*owner_, &key_), nullptr);
}

TEST_F(AssociatedObjects, StayUnderTheirKeyAndOwner) {
    const auto first = create<NSObject>();
    const auto second = create<NSObject>();
    const auto elsewhere = create<NSObject>();

    attach(*owner_, &key_, first);
    attach(*owner_, &otherKey_, second);

    EXPECT_EQ(objc_getAssociatedObject(*owner_, &key_), first);
    EXPECT_EQ(objc_getAssociatedObject(*owner_, &otherKey_), second);
    EXPECT_EQ(objc_getAssociatedObject(*elsewhere, &key_), nullptr);
}

TEST_F(AssociatedObjects, AreNoneUnderAnotherKeyOfTheirOwner) {
    attach(*owner_, &otherKey_, create<NSObject>());

    EXPECT_EQ(objc_getAssociatedObject(*owner_, &key_), nullptr);
}

TEST_F(AssociatedObjects, AreOwnedAndDieWithTheirOwner) {
    bool gone = false;
    attach(*owner_, &key_, companion(gone));
    ASSERT_FALSE(gone);

    owner_.reset();

    EXPECT_TRUE(gone);
}

TEST_F(AssociatedObjects, AreLetGoOfWhenAnotherOrNullTakesTheirPlace) {
    bool firstGone = false;
    bool secondGone = false;
    attach(*owner_, &key_, companion(firstGone));

    attach(*owner_, &key_, companion(secondGone));
    EXPECT_TRUE(firstGone);
    EXPECT_FALSE(secondGone);

    attach(*owner_, &key_, nullptr);
    EXPECT_TRUE(secondGone);
    EXPECT_EQ(objc_getAssociatedObject(*owner_, &key_), nullptr);
}

TEST_F(AssociatedObjects, MayChangeTheirOwnersObjectsWhileTheyGo) {
    bool gone = false;
    auto leaving = companion(gone);
    leaving->replaces = owner_.get();
    attach(*owner_, &key_, std::move(leaving));
    const auto next = create<NSObject>();

    attach(*owner_, &key_, next);

    EXPECT_TRUE(gone);
    EXPECT_EQ(objc_getAssociatedObject(*owner_, &key_), next);
}

class Listener : public NSObject {
  public:
    std::string answerTo(const std::string& question) { return "heard " + question; }

    std::string answer() { return "heard nothing"; }
};

TEST(Selectors, SendWhatTheirMethodTakesAndDropTheRest) {
    using Question = Selector<std::string(const std::string&)>;
    const auto listener = create<Listener>();

    const auto full = Question::of<&Listener::answerTo>("answerTo:");
    const auto brief = Question::of<&Listener::answer>("answer");

    EXPECT_EQ(full(*listener, "this"), "heard this");
    EXPECT_EQ(brief(*listener, "this"), "heard nothing");
    EXPECT_EQ(full.name(), "answerTo:");
}

TEST(Arrays, CountAsEmptyWhenNull) {
    const NSArray<NSNumber> none;
    const NSArray<NSNumber> one = std::make_shared<const std::vector<std::shared_ptr<NSNumber>>>(
        1, NSNumber::numberWithBool(true));

    EXPECT_TRUE(elements(none).empty());
    EXPECT_EQ(elements(one).size(), 1U);
}

} // namespace
