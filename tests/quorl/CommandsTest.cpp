// What is done from the command line without showing anything.

#include <filesystem>
#include <fstream>

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include "services/engine/Names.h"
#include "tests/quorl/QuorlProcess.h"
#include "tests/quorl/SampleMusic.h"
#include "tests/quorl/StoredPreferences.h"
#include "tests/quorl/desktop/OtherConnection.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

class Commands : public testing::Test {
  protected:
    /// Runs `quorl` to its end; gives its exit code back.
    int run(const std::vector<std::string>& arguments) {
        QuorlProcess quorl(arguments);
        const int code = quorl.end();
        output_ = quorl.output();
        errors_ = quorl.errors();
        return code;
    }

    /// The id of a playlist as it is listed.
    std::string idOf(const std::string& name) {
        EXPECT_EQ(run({"--playlists", "--json"}), 0) << errors_;
        for (const auto& playlist : nlohmann::json::parse(output_)) {
            if (playlist["name"] == name) {
                return playlist["id"];
            }
        }
        return "";
    }

    SampleMusic music_;
    std::string output_;
    std::string errors_;
};

TEST_F(Commands, playlistsAreThoseThatCanBeChosenWithSongsAndBytes) {
    EXPECT_EQ(run({"--playlists"}), 0);
    EXPECT_THAT(output_,
                AllOf(HasSubstr("\t3\t3145728\tLong Run\n"), HasSubstr("\t1\t1048576\tRoad Trip\n"),
                      Not(HasSubstr("Morning Mix"))));
}

TEST_F(Commands, playlistsOfAMissingFolderAreAFailure) {
    EXPECT_EQ(run({"--playlists", "--music", "/nonexistent"}), 3);
    EXPECT_THAT(errors_, HasSubstr("/nonexistent"));
}

TEST_F(Commands, choosingByNameOrIdIsStored) {
    const auto id = idOf("Road Trip");

    EXPECT_EQ(run({"--choose", "Road Trip"}), 0) << errors_;
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "true");
    EXPECT_THAT(storedPreference("asset-sync-playlist-persistent-id"), HasSubstr(id));

    const auto other = idOf("Long Run");
    EXPECT_EQ(run({"--choose", other}), 0) << errors_;
    EXPECT_THAT(storedPreference("asset-sync-playlist-persistent-id"), HasSubstr(other));
}

TEST_F(Commands, choosingNoneKeepsThePlaylist) {
    const auto id = idOf("Road Trip");
    ASSERT_EQ(run({"--choose", "Road Trip"}), 0) << errors_;

    EXPECT_EQ(run({"--choose", "none"}), 0) << errors_;

    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
    EXPECT_THAT(storedPreference("asset-sync-playlist-persistent-id"), HasSubstr(id));
}

TEST_F(Commands, choosingWhatIsNotOfferedSaysWhatToDoAndChangesNothing) {
    for (const auto* name : {"Nothing", "Morning Mix", "", "1"}) {
        EXPECT_EQ(run({"--choose", name}), 1) << name;
        EXPECT_THAT(errors_, HasSubstr("quorl --playlists")) << name;
    }
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
}

TEST_F(Commands, whatToDoIsToldInTheUsersLanguage) {
    QuorlProcess playlist({"--choose", "Nothing"}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(playlist.end(), 1);
    EXPECT_EQ(playlist.errors(), "quorl: Es gibt keine Playlist namens Nothing. \"quorl "
                                 "--playlists\" nennt die wählbaren.\n");

    QuorlProcess settings({"--choose", "none"},
                          {{"DBUS_SESSION_BUS_ADDRESS", "unix:path=/nowhere"}, {"LANGUAGE", "fr"}});
    EXPECT_EQ(settings.end(), 1);
    EXPECT_THAT(settings.errors(),
                AllOf(HasSubstr("Les réglages ne sont pas partagés avec le service"),
                      HasSubstr("fin du programme. Il n’y a pas de bus de session (")));
}

TEST_F(Commands, choosingANameThatTwoHaveListsTheirIds) {
    music_.folder().write("a/Road Trip.m3u8", "../one.flac\n");

    EXPECT_EQ(run({"--choose", "Road Trip"}), 1);

    EXPECT_THAT(errors_, AllOf(HasSubstr("Several"), HasSubstr("a/Road Trip.m3u8")));
    EXPECT_EQ(storedPreference("asset-sync-enabled"), "false");
}

TEST_F(Commands, limitIsStored) {
    EXPECT_EQ(run({"--limit", "50 songs"}), 0) << errors_;
    EXPECT_EQ(storedPreference("asset-sync-limit"), "@mt 50");
    EXPECT_EQ(storedPreference("asset-sync-limit-type"), "uint64 1");
    EXPECT_EQ(run({"--limit", "2048MB"}), 0) << errors_;
    EXPECT_EQ(storedPreference("asset-sync-limit"), "@mt 2048");
    EXPECT_EQ(storedPreference("asset-sync-limit-type"), "uint64 0");
}

TEST_F(Commands, limitThatIsNoneIsAMistake) {
    for (const auto* limit : {"50", "songs", "-1 songs", "0 MB", "1.5 MB", "50 GB", ""}) {
        EXPECT_EQ(run({"--limit", limit}), 2) << limit;
        EXPECT_THAT(errors_, HasSubstr("50 songs")) << limit;
    }
    EXPECT_EQ(storedPreference("asset-sync-limit"), "@mt 500");
}

/// A directory of the home to which music was synced before.
class KnownWearable {
  public:
    explicit KnownWearable(const std::string& name)
        : directory_(std::filesystem::path(qgetenv("HOME").toStdString()) / name) {
        create_directories(directory_ / ".quorl");
        std::ofstream(directory_ / ".quorl/manifest.1") << "anything";
    }

    ~KnownWearable() { remove_all(directory_); }

    KnownWearable(const KnownWearable&) = delete;
    KnownWearable& operator=(const KnownWearable&) = delete;

    [[nodiscard]] std::string path() const { return directory_.string(); }

  private:
    std::filesystem::path directory_;
};

TEST_F(Commands, wearablesAreThoseThatWereFoundWithTheChosenOneMarked) {
    const KnownWearable velora("Velora");

    EXPECT_EQ(run({"--wearables"}), 0) << errors_;
    EXPECT_THAT(output_, AllOf(HasSubstr("\tVelora\t" + velora.path() + "\n"),
                               HasSubstr("*\t\t\tOn this device (for trying out)\t\n")));

    EXPECT_EQ(run({"--wearables", "--json"}), 0) << errors_;
    const auto list = nlohmann::json::parse(output_);
    EXPECT_EQ(list.front()["directory"], velora.path());
    EXPECT_TRUE(list.front()["hasMusic"]);
    EXPECT_GT(list.front()["capacityBytes"], 0);
    EXPECT_TRUE(list.back()["embedded"]);
    EXPECT_TRUE(list.back()["chosen"]);
}

TEST_F(Commands, listsForProgramsAreTheSameInEveryLanguage) {
    QuorlProcess wearables({"--wearables"}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(wearables.end(), 0) << wearables.errors();
    EXPECT_THAT(wearables.output(), HasSubstr("*\t\t\tOn this device (for trying out)\t\n"));

    for (const auto& list :
         std::vector<std::vector<std::string>>{{"--playlists"}, {"--playlists", "--json"}}) {
        ASSERT_EQ(run(list), 0) << errors_;
        QuorlProcess playlists(list, {{"LANGUAGE", "de"}});
        EXPECT_EQ(playlists.end(), 0) << playlists.errors();
        EXPECT_EQ(playlists.output(), output_);
    }
}

TEST_F(Commands, withoutAnEngineNoWearableIsChosen) {
    EXPECT_EQ(run({"--use-wearable", "this-device"}), 1);
    EXPECT_THAT(errors_, HasSubstr("Start quorl-syncd"));
}

TEST_F(Commands, placesForGoodAreNotForATrial) {
    EXPECT_EQ(run({"--use-music", ""}), 2);
    EXPECT_EQ(run({"--use-music", "/a", "--music", "/b"}), 2);
    EXPECT_EQ(run({"--use-wearable", "/a", "--wearable", "/b"}), 2);
}

TEST_F(Commands, withoutAnEngineWaitingSaysWhatToDo) {
    EXPECT_EQ(run({"--wait"}), 1);
    EXPECT_THAT(errors_, HasSubstr("Start quorl-syncd"));
}

class CommandsWithEngine : public Commands {
  protected:
    CommandsWithEngine() {
        engine_.start(QStringLiteral(QUORL_ENGINE), {});
        if (!engine_.waitForStarted()) {
            throw std::runtime_error("the engine does not start");
        }
        waitForOwner(QString::fromLatin1(engine::busName), true);
    }

    ~CommandsWithEngine() override {
        engine_.terminate();
        engine_.waitForFinished();
    }

    QProcess engine_;
};

TEST_F(CommandsWithEngine, waitingEndsWhenTheChoiceIsOnTheWearable) {
    EXPECT_EQ(run({"--choose", "Road Trip", "--limit", "15 songs", "--wait"}), 0) << errors_;

    const auto wearable =
        std::filesystem::path(qgetenv("XDG_DATA_HOME").toStdString()) / "quorl/wearable/Music";
    EXPECT_TRUE(std::filesystem::exists(wearable / "Road Trip.m3u8"));
    EXPECT_THAT(output_, IsEmpty());

    EXPECT_EQ(run({"--choose", "Long Run", "--wait"}), 0) << errors_;
    EXPECT_TRUE(std::filesystem::exists(wearable / "Long Run.m3u8"));
}

TEST_F(CommandsWithEngine, wearableIsChosenForGoodByNameByPathOrAsThisDevice) {
    const KnownWearable velora("Velora");
    const KnownWearable other("Other");

    EXPECT_EQ(run({"--use-wearable", "Velora"}), 0) << errors_;
    EXPECT_EQ(storedPreference("wearable-directory"), "'" + velora.path() + "'");
    EXPECT_EQ(run({"--use-wearable", other.path() + "/"}), 0) << errors_;
    EXPECT_EQ(storedPreference("wearable-directory"), "'" + other.path() + "'");
    EXPECT_EQ(storedPreference("wearable-identity"), "''") << "it is on no drive";
    EXPECT_EQ(run({"--use-wearable", "this-device"}), 0) << errors_;
    EXPECT_EQ(storedPreference("wearable-directory"), "''");
}

TEST_F(CommandsWithEngine, wearableThatNobodyKnowsChangesNothing) {
    EXPECT_EQ(run({"--use-wearable", "Nothing"}), 1);
    EXPECT_THAT(errors_, HasSubstr("quorl --wearables"));
    EXPECT_EQ(storedPreference("wearable-directory"), "''");
}

TEST_F(CommandsWithEngine, musicFolderIsChosenForGood) {
    const TemporaryDirectory folder;

    EXPECT_EQ(run({"--use-music", folder.path().string()}), 0) << errors_;
    EXPECT_EQ(storedPreference("music-folder"), "'" + folder.path().string() + "'");
    EXPECT_EQ(run({"--use-music", "usual"}), 0) << errors_;
    EXPECT_EQ(storedPreference("music-folder"), "''");
}

TEST_F(CommandsWithEngine, waitingForNothingIsAFailure) {
    EXPECT_EQ(run({"--choose", "none", "--wait"}), 1);
    EXPECT_THAT(errors_, HasSubstr("Music sync is switched off."));
}

TEST_F(CommandsWithEngine, syncingWithNothingChosenSaysWhy) {
    EXPECT_EQ(run({"--sync"}), 1);
    EXPECT_THAT(errors_, HasSubstr("Music sync is switched off."));
}

TEST_F(CommandsWithEngine, syncingNowWaitsForASessionOfItsOwn) {
    ASSERT_EQ(run({"--choose", "Road Trip", "--wait"}), 0) << errors_;

    EXPECT_EQ(run({"--sync", "--wait"}), 0) << errors_;
    EXPECT_EQ(run({"--cancel"}), 0) << "nothing runs, which is no failure";
}

TEST_F(CommandsWithEngine, statusHasFiguresForPeople) {
    ASSERT_EQ(run({"--choose", "Road Trip", "--wait"}), 0) << errors_;

    EXPECT_EQ(run({"--status"}), 0);

    EXPECT_THAT(output_, HasSubstr(" of 4 GB free, 1 MB in songs"));
}

TEST_F(CommandsWithEngine, statusIsInTheUsersLanguageButNotForPrograms) {
    QuorlProcess people({"--status"}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(people.end(), 0) << people.errors();
    EXPECT_THAT(people.output(),
                testing::StartsWith("Playlist:       keine\n"
                                    "Sync:           aus\n"
                                    "Dienst:         Die Musiksynchronisierung ist "
                                    "ausgeschaltet.\n"
                                    "Wearable:       Velora, verbunden, "));
    EXPECT_THAT(people.output(), HasSubstr(" frei, 0 Byte in Titeln\nZuletzt:        noch nie\n"));

    QuorlProcess programs({"--status", "--json"}, {{"LANGUAGE", "de"}});
    EXPECT_EQ(programs.end(), 0) << programs.errors();
    const auto json = nlohmann::json::parse(programs.output());
    EXPECT_EQ(json["state"], "off");
    EXPECT_EQ(json["status"], "Music sync is switched off.");
}

} // namespace

} // namespace quorl::tests
