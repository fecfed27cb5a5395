#include "runtime/plugins/StringTable.h"

#include <cstdlib>
#include <fstream>

#include <gmock/gmock.h>

#include "tests/wearable/TemporaryDirectory.h"

namespace {

using quorl::StringTable;
using testing::ElementsAre;

class StringTables : public testing::Test {
  protected:
    [[nodiscard]] std::optional<std::string> text(const std::vector<std::string>& languages,
                                                  const std::string& key = "TITLE") const {
        return table_.text(languages, StringTable::defaultDomain, key);
    }

    StringTable table_{TEST_TEXTS};
};

TEST_F(StringTables, GiveTheTextOfTheFirstLanguageThatHasACatalogue) {
    EXPECT_EQ(text({"de", "en"}), "Ein Titel");
    EXPECT_EQ(text({"en", "de"}), "A title from the table");
    EXPECT_EQ(text({"it", "tlh", "de", "en"}), "Ein Titel");
    EXPECT_EQ(text({"ar"}), "عنوان");
}

TEST_F(StringTables, ServeALanguageOfACountryByTheLanguage) {
    EXPECT_EQ(text({"de_AT"}), "Ein Titel");
    EXPECT_EQ(text({"de_CH"}), "Ein Titel us de Schwiiz");
    EXPECT_EQ(text({"de-AT"}), "Ein Titel");
    EXPECT_EQ(text({"de_AT.UTF-8"}), "Ein Titel");
    EXPECT_EQ(text({"de_AT@euro"}), "Ein Titel");
}

TEST_F(StringTables, KeepTheLettersOfALanguageWithAModifier) {
    EXPECT_EQ(text({"sr@latin"}), "Naslov sa č i š");
}

TEST_F(StringTables, HaveNoTextForAKeyThatTheCatalogueLacks) {
    EXPECT_EQ(text({"de"}, "MISSING"), std::nullopt);
    EXPECT_EQ(text({"en", "de"}, "MISSING_ELSEWHERE"), std::nullopt)
        << "English was found, so German is not asked";
    EXPECT_EQ(text({"de", "en"}, "MISSING_ELSEWHERE"), "nur auf Deutsch: äöü");
    EXPECT_EQ(text({"de"}, ""), std::nullopt);
}

TEST_F(StringTables, HaveNoTextInALanguageWithoutACatalogue) {
    EXPECT_EQ(text({"it"}), std::nullopt);
    EXPECT_EQ(text({}), std::nullopt);
    EXPECT_EQ(text({"../locale/de"}), std::nullopt);
}

TEST_F(StringTables, ShowNoOtherLanguageToWhoPrefersEnglish) {
    quorl::wearable::testing::TemporaryDirectory withoutEnglish;
    std::filesystem::copy(std::filesystem::path(TEST_TEXTS) / "de", withoutEnglish.path() / "de",
                          std::filesystem::copy_options::recursive);
    const StringTable table(withoutEnglish.path());

    EXPECT_EQ(table.text({"en_GB", "de"}, StringTable::defaultDomain, "TITLE"), std::nullopt);
    EXPECT_EQ(table.text({"fr", "de"}, StringTable::defaultDomain, "TITLE"), "Ein Titel");
}

TEST_F(StringTables, SwitchTheLanguageWithinOneProcess) {
    EXPECT_EQ(text({"de"}), "Ein Titel");
    EXPECT_EQ(text({"en"}), "A title from the table");
    EXPECT_EQ(text({"de"}), "Ein Titel");
}

TEST_F(StringTables, KeepTheirDomainsApart) {
    EXPECT_EQ(table_.text({"en"}, "other", "TITLE"), "A title from the other table");
    EXPECT_EQ(table_.text({"de"}, "other", "TITLE"), std::nullopt);
}

TEST_F(StringTables, HaveNoTextWhereTheCatalogueIsDamaged) {
    quorl::wearable::testing::TemporaryDirectory damaged;
    const auto directory = damaged.path() / "de" / "LC_MESSAGES";
    std::filesystem::create_directories(directory);
    std::ofstream(directory / "default.mo") << "this is no catalogue";
    const StringTable table(damaged.path());

    EXPECT_EQ(table.text({"de"}, StringTable::defaultDomain, "TITLE"), std::nullopt);
}

class EnvironmentLanguages : public testing::Test {
  protected:
    EnvironmentLanguages() {
        for (const char* name : {"LANGUAGE", "LC_ALL", "LC_MESSAGES", "LANG"}) {
            unsetenv(name);
        }
    }

    static void set(const char* name, const char* value) { setenv(name, value, 1); }
};

TEST_F(EnvironmentLanguages, AreEnglishWhereNoneIsNamed) {
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("en"));
    set("LANG", "C.UTF-8");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("en"));
    set("LC_ALL", "POSIX");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("en"));
}

TEST_F(EnvironmentLanguages, ComeFromTheFirstVariableThatIsSet) {
    set("LANG", "fr_FR.UTF-8");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("fr_FR"));
    set("LC_MESSAGES", "de_AT");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("de_AT"));
    set("LC_ALL", "ar_EG.UTF-8");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("ar_EG"));
    set("LANGUAGE", "de_AT:de:en");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("de_AT", "de", "en"));
    set("LANGUAGE", "");
    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("ar_EG"));
}

TEST_F(EnvironmentLanguages, KeepModifiersAndDropEncodingsAndNonsense) {
    set("LANGUAGE", "sr_RS.UTF-8@latin::../../etc:de-AT");

    EXPECT_THAT(quorl::environmentLanguages(), ElementsAre("sr_RS@latin", "de_AT"));
}

} // namespace
