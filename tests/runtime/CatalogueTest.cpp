#include "runtime/plugins/Catalogue.h"

#include <algorithm>
#include <cstdint>
#include <utility>
#include <vector>

#include <gmock/gmock.h>

#include "runtime/plugins/BundleError.h"
#include "tests/runtime/Digests.h"
#include "tests/support/Damage.h"

namespace {

using namespace std::string_literals;
using quorl::BundleError;
using quorl::readCatalogue;
using quorl::Texts;
using quorl::tests::bytesOf;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;

const std::filesystem::path file = std::filesystem::path(TEST_TEXTS) / "de/LC_MESSAGES/default.mo";

enum class ByteOrder : std::uint8_t { LittleEndian, BigEndian };

/// The bytes of a catalogue, written number by number.
class Catalogue {
  public:
    explicit Catalogue(ByteOrder order = ByteOrder::LittleEndian) : order_(order) {}

    Catalogue& number(std::size_t value) {
        std::string bytes(4, '\0');
        for (char& byte : bytes) {
            byte = static_cast<char>(value & 0xFFU);
            value >>= 8U;
        }
        if (order_ == ByteOrder::BigEndian) {
            std::ranges::reverse(bytes);
        }
        bytes_ += bytes;
        return *this;
    }

    /// What comes before the tables: one of `count` keys, then one of as many texts.
    Catalogue& head(std::size_t count) {
        constexpr std::size_t mark = 0x950412DE;
        return number(mark).number(0).number(count).number(headSize).number(headSize + 8 * count);
    }

    Catalogue& string(const std::string& text) {
        bytes_ += text;
        return *this;
    }

    [[nodiscard]] const std::string& bytes() const { return bytes_; }

    static constexpr std::size_t headSize = 20;

  private:
    ByteOrder order_;
    std::string bytes_;
};

/// With one text, which is written after its key.
std::string catalogueOf(const std::string& key, const std::string& text,
                        ByteOrder order = ByteOrder::LittleEndian) {
    constexpr std::size_t strings = Catalogue::headSize + 16;
    Catalogue catalogue(order);
    catalogue.head(1).number(key.size()).number(strings);
    catalogue.number(text.size()).number(strings + key.size() + 1);
    return catalogue.string(key + '\0' + text + '\0').bytes();
}

bool isRefused(const std::string& bytes) {
    try {
        static_cast<void>(readCatalogue(bytes, file));
        return false;
    } catch (const BundleError& error) {
        EXPECT_EQ(error.file(), file);
        EXPECT_THAT(error.what(), testing::EndsWith("; install the plug-in again"));
        return true;
    }
}

TEST(Catalogues, GiveTheirTextsByTheirKeys) {
    const Texts texts = readCatalogue(bytesOf(file), file);

    EXPECT_THAT(texts, Contains(Pair("TITLE", "Ein Titel")));
    EXPECT_THAT(texts, Contains(Pair("MISSING_ELSEWHERE", "nur auf Deutsch: äöü")));
    EXPECT_THAT(texts, Contains(Pair("", testing::HasSubstr("charset=UTF-8"))));
    EXPECT_THAT(readCatalogue(Catalogue().head(0).bytes(), file), IsEmpty());
}

TEST(Catalogues, AreReadInEitherByteOrder) {
    EXPECT_THAT(readCatalogue(catalogueOf("KEY", "Übung", ByteOrder::LittleEndian), file),
                ElementsAre(Pair("KEY", "Übung")));
    EXPECT_THAT(readCatalogue(catalogueOf("KEY", "Übung", ByteOrder::BigEndian), file),
                ElementsAre(Pair("KEY", "Übung")));
}

TEST(Catalogues, GiveTheFirstOfPluralForms) {
    EXPECT_THAT(readCatalogue(catalogueOf("song\0songs"s, "Lied\0Lieder"s), file),
                ElementsAre(Pair("song", "Lied")));
}

TEST(Catalogues, ThatWereCutShortAreRefusedAtEveryLength) {
    const std::string whole = bytesOf(file);

    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_TRUE(isRefused(whole.substr(0, length))) << length;
    }
}

TEST(Catalogues, WithTextsThatAreNotUtf8AreRefused) {
    EXPECT_TRUE(isRefused(catalogueOf("KEY", "\xDC"
                                             "bung")));
    EXPECT_TRUE(isRefused(catalogueOf("KEY", "cut short: \xC3")));
    EXPECT_TRUE(isRefused(catalogueOf("KEY", "one\0\xFF"s)));
}

TEST(Catalogues, ThatDoNotBeginAsCataloguesDoAreRefused) {
    std::string bytes = catalogueOf("KEY", "text");
    bytes.front() = '\0';

    EXPECT_TRUE(isRefused(bytes));
    EXPECT_TRUE(isRefused("this is no catalogue of texts"));
}

TEST(Catalogues, WhoseStringsDoNotEndInANulAreRefused) {
    std::string bytes = catalogueOf("KEY", "text");
    bytes.back() = '.';

    EXPECT_TRUE(isRefused(bytes));
}

TEST(Catalogues, ThatNamePlacesTheyDoNotHaveAreRefused) {
    constexpr std::size_t most = 0xFFFF'FFFF;
    const std::string whole = catalogueOf("KEY", "text");
    for (std::size_t place = 8; place < Catalogue::headSize + 16; place += 4) {
        for (const std::size_t number : {most, most - 7, most / 2, whole.size()}) {
            std::string bytes = whole;
            bytes.replace(place, 4, Catalogue().number(number).bytes());
            EXPECT_TRUE(isRefused(bytes)) << number << " at " << place;
        }
    }
}

TEST(Catalogues, ThatRepeatOneLongTextForManyKeysAreRefused) {
    constexpr std::size_t count = 1000;
    const std::string text(10'000, 'a');
    constexpr std::size_t strings = Catalogue::headSize + 16 * count;
    Catalogue catalogue;
    catalogue.head(count);
    for (std::size_t index = 0; index < 2 * count; ++index) {
        catalogue.number(text.size()).number(strings);
    }

    EXPECT_TRUE(isRefused(catalogue.string(text + '\0').bytes()));
}

TEST(Catalogues, ThatWereDamagedAreRefusedOrGiveTexts) {
    const std::string whole = bytesOf(file);
    quorl::tests::Damage damage;
    int refused = 0;

    for (int count = 0; count < 1000; ++count) {
        refused += isRefused(damage.of(whole)) ? 1 : 0;
    }

    EXPECT_GT(refused, 100);
    EXPECT_LT(refused, 1000) << "some damages only change letters";
}

} // namespace
