#include <gmock/gmock.h>

#include "quorl/facts/EngineTrouble.h"
#include "quorl/facts/FolderTrouble.h"
#include "services/engine/Codes.h"

namespace quorl::tests {

namespace {

using testing::HasSubstr;
using testing::Optional;

namespace code = engine::code;

engine::EngineState stateWith(const std::string& syncState, const std::string& statusCode,
                              const std::string& status) {
    engine::EngineState state;
    state.isThere = true;
    state.engine.syncState = syncState;
    state.engine.statusCode = statusCode;
    state.engine.status = status;
    return state;
}

/// The last sync has come to this, and is not tried again.
engine::EngineState afterFailure(const std::string& lastCode) {
    auto state = stateWith("pending", lastCode, "It went wrong.");
    state.engine.lastCode = lastCode;
    state.engine.lastMessage = "It went wrong.";
    return state;
}

TEST(EngineTrouble, isThatThereIsNoEngine) {
    const auto trouble = troubleIn(engine::EngineState());
    ASSERT_TRUE(trouble);
    EXPECT_EQ(trouble->remedy, Remedy::StartEngine);
    EXPECT_EQ(nameOf(trouble->remedy), "Start");
}

TEST(EngineTrouble, isWhatTheLastSyncCameTo) {
    for (const auto* lastCode :
         {code::wearableFull, code::writeProtected, code::wentAway, code::songsLeftOut}) {
        const auto trouble = troubleIn(afterFailure(lastCode));
        ASSERT_TRUE(trouble) << lastCode;
        EXPECT_EQ(trouble->sentence, "It went wrong.");
        EXPECT_EQ(trouble->remedy, Remedy::TryAgain);
    }
}

TEST(EngineTrouble, isNoneWhereSomebodyHasEndedTheSync) {
    for (const auto* lastCode : {code::cancelled, code::ended, code::somethingElseChosen}) {
        EXPECT_FALSE(troubleIn(afterFailure(lastCode))) << lastCode;
    }
}

TEST(EngineTrouble, isNoneWhereTheFailureIsPast) {
    auto state = afterFailure(code::wearableFull);
    state.engine.status = "About to sync music.";
    EXPECT_FALSE(troubleIn(state));
    state = afterFailure(code::wearableFull);
    state.engine.syncState = "off";
    EXPECT_FALSE(troubleIn(state));
}

TEST(EngineTrouble, isNoneWhereOneOnlyHasToWait) {
    for (const auto* statusCode : {code::notOnCharger, code::notConnected, code::aboutToSync}) {
        EXPECT_FALSE(troubleIn(stateWith("pending", statusCode, "Wait."))) << statusCode;
    }
    EXPECT_FALSE(troubleIn(stateWith("synced", code::upToDate, "Everything is up to date.")));
}

TEST(EngineTrouble, isWhatIsTheMatterWithTheWearable) {
    EXPECT_THAT(troubleIn(stateWith("pending", code::other, "The Velora cannot be read.")),
                Optional(EngineTrouble{"The Velora cannot be read.", Remedy::LookAgain}));
}

media::Inventory folderAt(const char* root) {
    media::Inventory inventory;
    inventory.root = root;
    inventory.rootFound = true;
    return inventory;
}

TEST(FolderTrouble, saysWhatWasLookedForWhereAndWhatToDo) {
    auto missing = folderAt("/home/me/Music");
    missing.rootFound = false;
    EXPECT_EQ(troubleIn(missing),
              "There is no music folder at /home/me/Music. Create it, or choose another one.");
    auto unreadable = folderAt("/home/me/Music");
    unreadable.leftOut.push_back({"", "", media::Reason::DirectoryUnreadable});
    EXPECT_THAT(troubleIn(unreadable), HasSubstr("/home/me/Music cannot be read. Change"));
    EXPECT_THAT(troubleIn(folderAt("/home/me/Music")), HasSubstr("There are no playlists in"));
}

TEST(FolderTrouble, isNoneWhereThereIsAPlaylist) {
    auto inventory = folderAt("/home/me/Music");
    inventory.playlists.emplace_back();
    inventory.leftOut.push_back({"some/folder", "", media::Reason::DirectoryUnreadable});
    EXPECT_EQ(troubleIn(inventory), "");
}

TEST(FolderTrouble, namesOfFoldersSteerNoTerminal) {
    EXPECT_THAT(troubleIn(folderAt("/a\x1b[2J")), HasSubstr("/a\uFFFD[2J"));
}

} // namespace

} // namespace quorl::tests
