#include "runtime/plugins/StringTable.h"

#include <cstdlib>
#include <fstream>
#include <functional>

#include <gmock/gmock.h>

#include "tests/base/TemporaryDirectory.h"
#include "tests/runtime/Digests.h"
#include "tests/support/Damage.h"

namespace {

using quorl::BundleFiles;
using quorl::Digests;
using quorl::StringTable;
using quorl::tests::bytesOf;
using quorl::tests::digestsOfTexts;
using quorl::tests::TemporaryDirectory;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class StringTables : public testing::Test {
  protected:
    [[nodiscard]] std::optional<std::string> text(const std::vector<std::string>& languages,
                                                  const std::string& key = "TITLE") const {
        return table_.text(languages, StringTable::defaultDomain, key);
    }

    const std::filesystem::path bundle_ = std::filesystem::path(TEST_TEXTS).parent_path();
    BundleFiles files_{bundle_, digestsOfTexts(bundle_)};
    StringTable table_{files_};
};

/// The bundle of a test that changes its German table.
class DamagedStringTables : public testing::Test {
  protected:
    DamagedStringTables() {
        std::filesystem::create_directory(bundle_.path() / "locale");
        std::filesystem::copy(std::filesystem::path(TEST_TEXTS) / "de",
                              bundle_.path() / "locale/de",
                              std::filesystem::copy_options::recursive);
    }

    void write(std::string_view bytes) const {
        const auto file = bundle_.path() / germanTable;
        std::filesystem::remove(file); // replaced contents go to the disk, which takes long
        std::ofstream(file, std::ios::binary) << bytes;
    }

    [[nodiscard]] std::optional<std::string> title(const Digests& digests) const {
        const BundleFiles files(bundle_.path(), digests);
        return StringTable(files).text({"de"}, StringTable::defaultDomain, "TITLE");
    }

    /// What is told on the standard error stream while `act` runs.
    static std::string told(const std::function<void()>& act) {
        testing::internal::CaptureStderr();
        act();
        return testing::internal::GetCapturedStderr();
    }

    static constexpr const char* germanTable = "locale/de/LC_MESSAGES/default.mo";

    TemporaryDirectory bundle_;
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
    TemporaryDirectory withoutEnglish;
    std::filesystem::create_directory(withoutEnglish.path() / "locale");
    std::filesystem::copy(std::filesystem::path(TEST_TEXTS) / "de",
                          withoutEnglish.path() / "locale/de",
                          std::filesystem::copy_options::recursive);
    const BundleFiles files(withoutEnglish.path(), digestsOfTexts(withoutEnglish.path()));
    const StringTable table(files);

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

TEST_F(DamagedStringTables, CountAsNoneAndAreToldOnce) {
    const Digests digests = digestsOfTexts(bundle_.path());
    EXPECT_THAT(told([&] { EXPECT_EQ(title(digests), "Ein Titel"); }), IsEmpty());
    write(bytesOf(bundle_.path() / germanTable) + "\n");

    const BundleFiles files(bundle_.path(), digests);
    const StringTable table(files);
    const auto ask = [&] {
        EXPECT_EQ(table.text({"de"}, StringTable::defaultDomain, "TITLE"), std::nullopt);
    };

    EXPECT_THAT(told(ask), testing::AllOf(HasSubstr((bundle_.path() / germanTable).string()),
                                          HasSubstr("install the plug-in again")));
    EXPECT_THAT(told(ask), IsEmpty());
}

TEST_F(DamagedStringTables, CountAsNoneWhereTheyAreMissingOrWereNeverRecorded) {
    const Digests digests = digestsOfTexts(bundle_.path());

    EXPECT_THAT(told([&] { EXPECT_EQ(title({}), std::nullopt); }), HasSubstr("default.mo"));
    std::filesystem::remove(bundle_.path() / germanTable);
    EXPECT_THAT(told([&] { EXPECT_EQ(title(digests), std::nullopt); }), HasSubstr("missing"));
    EXPECT_THAT(told([&] { EXPECT_EQ(title({}), std::nullopt); }), IsEmpty());
}

TEST_F(DamagedStringTables, CountAsNoneWhereTheyWereNoCatalogueFromTheStart) {
    write("this is no catalogue");

    EXPECT_THAT(told([&] { EXPECT_EQ(title(digestsOfTexts(bundle_.path())), std::nullopt); }),
                HasSubstr("default.mo: "));
}

TEST_F(DamagedStringTables, CountAsNoneWhateverTheDamage) {
    const Digests digests = digestsOfTexts(bundle_.path());
    const std::string whole = bytesOf(bundle_.path() / germanTable);
    quorl::tests::Damage damage;

    static_cast<void>(told([&] {
        for (int count = 0; count < 1000; ++count) {
            write(damage.of(whole));
            ASSERT_EQ(title(digests), std::nullopt) << count;
        }
    }));
}

TEST_F(DamagedStringTables, ThatABundleWasMadeWithGiveATextOrNone) {
    const std::string whole = bytesOf(bundle_.path() / germanTable);
    quorl::tests::Damage damage;
    int found = 0;

    static_cast<void>(told([&] {
        for (int count = 0; count < 1000; ++count) {
            write(damage.of(whole));
            found += title(digestsOfTexts(bundle_.path())) ? 1 : 0;
        }
    }));

    EXPECT_GT(found, 0) << "the digests keep the reader from seeing any damage";
    EXPECT_LT(found, 1000);
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
