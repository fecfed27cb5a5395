#pragma once

#include <condition_variable>
#include <deque>
#include <filesystem>
#include <map>
#include <mutex>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "services/preferences/Pointers.h"
#include "services/preferences/SharedPreferences.h"

/// What the tests of the preferences need of the login session that tests/session-run gives them.
namespace quorl::preferences::testing {

/// A test that may change what is stored: it fails outside of tests/session-run, where that would
/// be the person's own, and begins with the defaults.
class DesktopSessionTest : public ::testing::Test {
  protected:
    DesktopSessionTest();
};

/// Environment of a program, on top of the test's own.
using Environment = std::map<std::string, std::string>;

/// A program whose output is read line by line. Killed at the end.
class Program {
  public:
    explicit Program(const std::vector<std::string>& command, const Environment& environment = {});
    Program(const Program&) = delete;
    Program& operator=(const Program&) = delete;
    ~Program();

    void say(const std::string& line);

    /// Waits for the next line; an empty text at the end of the output.
    [[nodiscard]] std::string nextLine();

    void kill();

    /// Waits for the end of the program; gives back whether it ended well.
    bool wait();

  private:
    ObjectPointer<GSubprocess> process_;
    ObjectPointer<GDataInputStream> output_;
};

/// tests/preferences/PreferencesPeer.cpp, running.
class Peer {
  public:
    explicit Peer(const Environment& environment = {},
                  const std::filesystem::path& program = PEER_PROGRAM,
                  base::Purpose purpose = base::Purpose::Use);

    /// The line with which it began.
    [[nodiscard]] const std::string& greeting() const { return greeting_; }

    void say(const std::string& line) { program_.say(line); }

    /// The next line that is not about what the peer was told.
    std::string reply();

    /// `say` and `reply`.
    std::string ask(const std::string& line);

    /// The next keys of which the peer was told, separated by blanks.
    std::string nextTold();

    void kill() { program_.kill(); }

  private:
    Program program_;
    std::deque<std::string> told_;
    std::string greeting_;
};

/// Runs a command to its end and gives back its output, without the last line's end. Throws if it
/// fails.
std::string run(const std::vector<std::string>& command);

/// Runs `gsettings COMMAND SCHEMA ARGUMENTS`.
std::string gsettings(const std::string& command, const std::vector<std::string>& arguments = {});

/// What a `SharedPreferences` of the test was told.
class Told {
  public:
    /// The callback to open the preferences with; lives no longer than this object.
    [[nodiscard]] SharedPreferences::Changed callback();

    /// Waits for the next.
    [[nodiscard]] KeySet next();

  private:
    std::mutex mutex_;
    std::condition_variable more_;
    std::deque<KeySet> all_;
};

/// Opens the preferences and throws where they are not shared.
std::unique_ptr<SharedPreferences> openShared(SharedPreferences::Changed changed = {});

/// A bystander on the session bus: sees each announcement of the store, whoever caused it.
class Bystander {
  public:
    Bystander();
    Bystander(const Bystander&) = delete;
    Bystander& operator=(const Bystander&) = delete;
    ~Bystander();

    /// Waits for the next announcement; gives back the key, or keys separated by blanks.
    [[nodiscard]] std::string next();

  private:
    static void onSignal(GDBusConnection* connection, const char* sender, const char* path,
                         const char* interface, const char* member, GVariant* parameters,
                         void* bystander);

    ContextPointer context_ = ContextPointer(g_main_context_new());
    ObjectPointer<GDBusConnection> bus_;
    guint subscription_ = 0;
    std::deque<std::string> seen_;
};

/// Makes the dconf service hang. Gives back false where it did not run.
bool stopSettingsService();

/// Kills the dconf service and waits until the session bus knows that it is gone. Gives back false
/// where it did not run.
bool killSettingsService();

/// One more session bus, which can go away and come back at the same address.
class SecondBus {
  public:
    SecondBus();
    void start();
    void kill();

    [[nodiscard]] const std::string& address() const { return address_; }

  private:
    std::string address_;
    std::unique_ptr<Program> daemon_;
};

} // namespace quorl::preferences::testing
