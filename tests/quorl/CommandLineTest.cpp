#include <gmock/gmock.h>

#include "tests/quorl/QuorlProcess.h"

namespace quorl::tests {

namespace {

using testing::AllOf;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

TEST(CommandLine, helpTellsOptionsAndExitCodes) {
    QuorlProcess quorl({"--help"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), HasSubstr("\n  --screenshot FILE           Write a picture of"));
    EXPECT_THAT(quorl.output(), HasSubstr("\n  --text                      Show the pane in"));
    EXPECT_THAT(quorl.output(), HasSubstr("Exit codes:"));
    EXPECT_THAT(quorl.errors(), IsEmpty());
}

TEST(CommandLine, helpIsInTheUsersLanguage) {
    QuorlProcess german({"--help"}, {{"LANGUAGE", "de_AT:fr"}});
    EXPECT_EQ(german.end(), 0);
    EXPECT_THAT(german.output(), StartsWith("Wählt die Musik, die auf deine Velora kommt.\n"
                                            "Aufruf: quorl [OPTIONEN]\n"));
    EXPECT_THAT(german.output(), AllOf(HasSubstr("\nOptionen:\n"), HasSubstr("\nExit-Codes:\n")));

    QuorlProcess arabic({"--help"}, {{"LC_ALL", "ar_EG.UTF-8"}});
    EXPECT_EQ(arabic.end(), 0);
    EXPECT_THAT(arabic.output(), StartsWith("يختار الموسيقى التي تُنقل إلى Velora.\n"
                                            "الاستخدام: quorl [الخيارات]\n"));
    EXPECT_THAT(arabic.output(), HasSubstr("رموز الإنهاء:"));
}

TEST(CommandLine, versionIsOneLineWithTheName) {
    QuorlProcess quorl({"--version"});
    EXPECT_EQ(quorl.end(), 0);
    EXPECT_THAT(quorl.output(), StartsWith("quorl "));
}

class Mistake : public testing::TestWithParam<std::vector<std::string>> {};

TEST_P(Mistake, endsWithTwoAndSaysWhatToDo) {
    QuorlProcess quorl(GetParam());
    EXPECT_EQ(quorl.end(), 2);
    EXPECT_THAT(quorl.errors(), HasSubstr("quorl --help"));
    EXPECT_THAT(quorl.output(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(
    CommandLine, Mistake,
    testing::Values(std::vector<std::string>{"--unknown"}, std::vector<std::string>{"extra"},
                    std::vector<std::string>{"--text", "--library"},
                    std::vector<std::string>{"--json"},
                    std::vector<std::string>{"--choose", "x", "--text"},
                    std::vector<std::string>{"--sync", "--cancel"},
                    std::vector<std::string>{"--limit", "1 song", "--music", "/tmp"},
                    std::vector<std::string>{"--dark"}, std::vector<std::string>{"--screenshot"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "360"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "360x720x2"},
                    std::vector<std::string>{"--screenshot", "a.png", "--size", "0x99999"},
                    std::vector<std::string>{"--screenshot", "a.png", "--scale", "0"},
                    std::vector<std::string>{"--screenshot", "a.png", "--pane", "other"},
                    std::vector<std::string>{"--plugins", "/nonexistent"}));

TEST(CommandLine, mistakesAreToldInTheUsersLanguage) {
    const std::vector<std::pair<std::vector<std::string>, std::string>> mistakes{
        {{"--unknown", "other"}, "„--unknown“ gehört nicht hierher."},
        {{"--text", "--library"}, "--text geht nicht zusammen mit --library."},
        {{"--dark"}, "--dark geht nur zusammen mit --screenshot."},
        {{"--screenshot"}, "--screenshot braucht genau einen Wert."},
        {{"--choose", "a", "--choose", "b"}, "--choose braucht genau einen Wert."},
        {{"--text=x"}, "--text nimmt den angegebenen Wert nicht an."},
        {{"--json"}, "--json: gib --status, --playlists oder --wearables mit an"},
        {{"--use-music", ""}, "--use-music: nenne einen Ordner"},
        {{"--plugins", "/nonexistent"}, "--plugins: nenne ein Verzeichnis, das es gibt"},
        {{"--limit", "some"},
         "--limit: gib das Limit als Zahl von Titeln oder Megabytes an, zum Beispiel \"50 songs\" "
         "oder \"500 MB\""},
        {{"--screenshot", "a.png", "--scale", "9"}, "--scale: gib eine Zahl von 1 bis 4 an"},
        {{"--screenshot", "a.png", "--pane", "other"},
         "--pane: gib root, playlist, limit oder front an"},
        {{"--screenshot", "a.png", "--size", "1x1"},
         "--size: gib die Größe als BREITExHÖHE an, jede von 200 bis 8192, zum Beispiel 360x720"},
    };
    for (const auto& [arguments, sentence] : mistakes) {
        QuorlProcess german(arguments, {{"LANGUAGE", "de"}});
        EXPECT_EQ(german.end(), 2);
        EXPECT_EQ(german.errors(),
                  "quorl: " + sentence + "\n\"quorl --help\" zeigt die Optionen.\n");
    }

    QuorlProcess arabic({"--unknown"}, {{"LANGUAGE", "ar"}});
    EXPECT_EQ(arabic.end(), 2);
    EXPECT_EQ(arabic.errors(), "quorl: لا مكان هنا لـ «--unknown».\n"
                               "شغّل «quorl --help» لعرض الخيارات.\n");
}

TEST(CommandLine, thatOfTheEngineIsInTheUsersLanguage) {
    const auto run = [](const char* argument) {
        QProcess engine;
        auto environment = QProcessEnvironment::systemEnvironment();
        environment.insert(QStringLiteral("LANGUAGE"), QStringLiteral("de"));
        engine.setProcessEnvironment(environment);
        engine.start(QStringLiteral(QUORL_ENGINE), {QString::fromLatin1(argument)});
        EXPECT_TRUE(engine.waitForFinished());
        return std::pair(engine.readAllStandardOutput().toStdString(),
                         engine.readAllStandardError().toStdString());
    };
    EXPECT_THAT(run("--help").first, AllOf(StartsWith("Bringt die gewählte Playlist"),
                                           HasSubstr("\nAufruf: quorl-syncd [OPTIONEN]\n"),
                                           HasSubstr("--rate-limit BYTES")));
    EXPECT_EQ(run("--retry-after=0").second,
              "quorl-syncd: --retry-after: gib eine Zahl von 1 bis 3600 an\n"
              "\"quorl-syncd --help\" zeigt die Optionen.\n");
    EXPECT_THAT(run("--rate-limit=-1").second, HasSubstr("--rate-limit: gib eine Zahl ab 0 an\n"));
}

TEST(CommandLine, trialOfAFolderWhoseNameIsNoTextSaysWhatToDo) {
    QProcess shell;
    shell.start(QStringLiteral("sh"),
                {QStringLiteral("-c"),
                 QStringLiteral("exec \"$0\" --text --music \"$(printf '/tmp/m\\377sic')\""),
                 QStringLiteral(QUORL_PROGRAM)});
    ASSERT_TRUE(shell.waitForFinished(60'000));
    EXPECT_EQ(shell.exitCode(), 2);
    EXPECT_THAT(shell.readAllStandardError().toStdString(),
                AllOf(HasSubstr("/tmp/m\uFFFDsic"), HasSubstr("UTF-8, rename it")));
}

TEST(CommandLine, windowWithoutADisplaySaysWhatToUseInstead) {
    QuorlProcess quorl({}, {{"DISPLAY", ""}, {"WAYLAND_DISPLAY", ""}, {"LANGUAGE", "de"}});
    EXPECT_EQ(quorl.end(), 1);
    EXPECT_EQ(quorl.errors(), "quorl: Hier gibt es keine Anzeige. Starte quorl in einer grafischen "
                              "Sitzung oder mit --text.\n");
}

} // namespace

} // namespace quorl::tests
