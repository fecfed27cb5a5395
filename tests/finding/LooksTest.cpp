// Places that do not answer keep nobody waiting.

#include "services/finding/Looks.h"

#include <atomic>
#include <semaphore>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace quorl::finding {

namespace {

using namespace std::chrono_literals;

/// A drive at /hanging does not answer until it is released; others answer at once.
struct Drives {
    std::counting_semaphore<> release{0};
    std::atomic<int> looks = 0;

    [[nodiscard]] static Looks::Look look(const std::shared_ptr<Drives>& drives) {
        return [drives](const Place& place) {
            ++drives->looks;
            if (place.directory == "/hanging") {
                drives->release.acquire();
            }
            return Find{Space{7, 6}, {}};
        };
    }
};

const std::vector<Place> places{{"/fine", true, true}, {"/hanging", true, true}};

TEST(Looks, GoOnWithoutWhatDoesNotAnswerAndSendNobodyAfterIt) {
    const auto drives = std::make_shared<Drives>();
    Looks looks(Drives::look(drives), 1ms);

    for (int round = 0; round < 3; ++round) {
        EXPECT_FALSE(looks.at(places).contains("/hanging"));
    }

    EXPECT_LE(drives->looks, 1 + 3);
    drives->release.release();
}

TEST(Looks, FindAllThatAnswers) {
    const auto drives = std::make_shared<Drives>();
    drives->release.release();
    Looks looks(Drives::look(drives), 1h);

    const auto found = looks.at(places);

    EXPECT_EQ(found.size(), 2U);
    EXPECT_EQ(found.at("/hanging").space, (Space{7, 6}));
    EXPECT_TRUE(looks.at({}).empty());
}

} // namespace

} // namespace quorl::finding
