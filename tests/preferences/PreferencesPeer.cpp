// Another program that uses the shared preferences, those in the file that is its argument where it
// has one. It obeys lines on its standard input:
//
//   get KEY            says the value
//   set KEY VALUE      says "stored", "same", or "failed: " and why
//   count KEY FIRST    writes FIRST, FIRST + 1, ... until it is killed; says each that was stored
//   taps COUNT         writes the limit, then its type, COUNT times, while another thread reads
//   both;
//                      says "done"
//
// It begins with "ready", "limited: " and why, or "failed: " and why. In between it says "told "
// and the keys whenever it is told of changes.

#include <iostream>
#include <mutex>
#include <sstream>
#include <thread>

#include "services/preferences/SharedPreferences.h"
#include "tests/preferences/ValueText.h"

namespace {

using namespace quorl::preferences;

/// Writes whole lines; any thread.
class Speaker {
  public:
    void say(const std::string& line) {
        const std::scoped_lock lock(mutex_);
        std::cout << line << std::endl;
    }

  private:
    std::mutex mutex_;
};

std::string outcome(const WriteResult& result) {
    if (!result.problem.empty()) {
        return "failed: " + result.problem;
    }
    return result.changed ? "stored" : "same";
}

/// Calls the action with the preference of that name.
template <class Action>
void withPreference(const std::string& key, Action&& action) {
    forEachPreference([&](const auto& preference) {
        if (key == preference.key) {
            action(preference);
        }
    });
}

class Peer {
  public:
    Peer(SharedPreferences& preferences, Speaker& speaker)
        : preferences_(preferences), speaker_(speaker) {}

    void obey(const std::string& line) {
        std::istringstream words(line);
        std::string command;
        std::string key;
        std::string argument;
        words >> command >> key >> argument;
        if (command == "get") {
            get(key);
        } else if (command == "set") {
            set(key, argument);
        } else if (command == "count") {
            count(key, numberIn(argument));
        } else if (command == "taps") {
            tap(numberIn(key));
        }
    }

  private:
    void get(const std::string& key) {
        withPreference(key, [this](const auto& preference) {
            speaker_.say(textOf(preferences_.get(preference)));
        });
    }

    void set(const std::string& key, const std::string& text) {
        withPreference(key, [&]<class T>(const Preference<T>& preference) {
            T value;
            readText(text, value);
            speaker_.say(outcome(preferences_.set(preference, value)));
        });
    }

    void count(const std::string& key, std::uint64_t first) {
        withPreference(key, [&]<class T>(const Preference<T>& preference) {
            if constexpr (std::is_constructible_v<T, std::uint64_t> && !std::is_same_v<T, bool>) {
                for (auto number = first;; ++number) {
                    const auto result = preferences_.set(preference, number);
                    speaker_.say(result.changed ? std::to_string(number) : outcome(result));
                }
            }
        });
    }

    void tap(std::uint64_t times) {
        const std::jthread reader([this](const std::stop_token& stop) {
            while (!stop.stop_requested()) {
                (void)preferences_.get(assetSyncLimit);
                (void)preferences_.get(assetSyncLimitType);
            }
        });
        for (std::uint64_t i = 1; i <= times; ++i) {
            const auto limit = preferences_.set(assetSyncLimit, i);
            const auto type = preferences_.set(assetSyncLimitType, i % 2);
            if (!limit.changed || !type.changed) {
                speaker_.say(outcome(limit) + ", " + outcome(type));
                return;
            }
        }
        speaker_.say("done");
    }

    SharedPreferences& preferences_;
    Speaker& speaker_;
};

std::string told(const KeySet& keys) {
    std::string line = "told";
    for (const auto key : keys) {
        line += " " + std::string(key);
    }
    return line;
}

} // namespace

int main(int argc, char** /*argv*/) {
    Speaker speaker;
    const auto opened = SharedPreferences::open(
        [&speaker](SharedPreferences&, const KeySet& keys) { speaker.say(told(keys)); },
        argc > 1 ? quorl::base::Purpose::Trial : quorl::base::Purpose::Use);
    if (!opened.preferences) {
        speaker.say("failed: " + opened.problem);
        return 1;
    }
    speaker.say(opened.problem.empty() ? "ready" : "limited: " + opened.problem);
    Peer peer(*opened.preferences, speaker);
    for (std::string line; std::getline(std::cin, line);) {
        peer.obey(line);
    }
    return 0;
}
