#include "quorl/commands/EngineWatch.h"

#include <future>

#include "services/language/Translated.h"

namespace quorl {

EngineWatch::EngineWatch() : client_([this](const engine::Event& event) { take(event); }) {}

void EngineWatch::take(const engine::Event& event) {
    const std::scoped_lock lock(mutex_);
    state_ = event.state;
    problem_ = event.state->isThere ? "" : event.message;
    changed_.notify_all();
}

std::variant<std::shared_ptr<const engine::EngineState>, std::string>
EngineWatch::waitUntil(const Condition& condition) {
    std::unique_lock lock(mutex_);
    changed_.wait(lock, [&] { return state_ && (!state_->isThere || condition(*state_)); });
    if (state_->isThere) {
        return state_;
    }
    return language::filled(
        language::translated(
            "The sync engine is not running. Start quorl-syncd, or log in again. ({reason})"),
        {{"reason", problem_}});
}

std::string EngineWatch::ask(void (engine::Client::*what)(engine::Client::Reply)) {
    std::promise<std::string> answer;
    (client_.*what)([&answer](const std::string& problem) { answer.set_value(problem); });
    return answer.get_future().get();
}

std::string EngineWatch::tell(void (engine::Client::*what)(const std::string&,
                                                           engine::Client::Reply),
                              const std::string& text) {
    std::promise<std::string> answer;
    (client_.*what)(text, [&answer](const std::string& problem) { answer.set_value(problem); });
    return answer.get_future().get();
}

} // namespace quorl
