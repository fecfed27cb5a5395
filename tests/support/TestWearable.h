#pragma once

#include <deque>

#include "runtime/services/WearableConnection.h"
#include "tests/support/Journal.h"

namespace quorl::tests {

/// A wearable that holds its replies until the test has it reply, with the lines "wearable connect"
/// and "wearable usage". It outlives its connections.
class TestWearable {
  public:
    using Figures = std::map<std::string, double>;

    explicit TestWearable(Journal& journal) : journal_(journal) {}

    [[nodiscard]] std::shared_ptr<WearableConnection> connect();

    /// The questions that have no reply yet.
    [[nodiscard]] std::size_t openQuestions() const { return questions_.size(); }

    /// Takes the oldest question, which the caller answers.
    [[nodiscard]] LSSManager::UsageHandler takeQuestion();

    /// Answers the oldest question with figures by key, or with the free and the songs' bytes.
    void reply(const Figures& figures);
    void reply(double available, double songs);

    /// Answers the oldest question with an error.
    void fail(const std::string& problem);

  private:
    class Connection;

    Journal& journal_;
    std::deque<LSSManager::UsageHandler> questions_;
};

} // namespace quorl::tests
