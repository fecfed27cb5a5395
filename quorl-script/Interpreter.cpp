#include "quorl-script/Interpreter.h"

namespace quorl {

namespace {

constexpr int deepestNesting = 64;

/// How deep the brackets of a line go, as far as that is of interest.
int nestingOf(std::string_view line) {
    int depth = 0;
    int deepest = 0;
    bool isInText = false;
    for (std::size_t at = 0; at < line.size() && deepest <= deepestNesting; ++at) {
        const char character = line[at];
        if (isInText) {
            at += character == '\\' ? 1 : 0;
            isInText = character != '"';
        } else if (character == '"') {
            isInText = true;
        } else if (character == '[' || character == '{') {
            deepest = std::max(deepest, ++depth);
        } else if (character == ']' || character == '}') {
            --depth;
        }
    }
    return deepest;
}

/// The parser itself takes any depth, but each level costs memory many times its length.
nlohmann::json parse(std::string_view line) {
    if (nestingOf(line) > deepestNesting) {
        throw CommandError("the line is not taken: it is nested deeper than " +
                           std::to_string(deepestNesting) + " levels");
    }
    try {
        return nlohmann::json::parse(line);
    } catch (const nlohmann::json::parse_error& error) {
        throw CommandError("the line is not valid JSON: see its byte " +
                           std::to_string(error.byte));
    } catch (const nlohmann::json::out_of_range&) {
        throw CommandError("the line is not valid JSON: it has a number out of range");
    }
}

/// The trace comes first, then what `results` has.
Json success(Json trace, Json results) {
    Json reply;
    reply["ok"] = true;
    reply["trace"] = std::move(trace);
    if (results.is_object()) {
        for (auto& [name, result] : results.items()) {
            reply[name] = std::move(result);
        }
    }
    return reply;
}

std::string textOfReply(const Json& reply) {
    return reply.dump(-1, ' ', false, Json::error_handler_t::replace);
}

} // namespace

std::string Interpreter::reply(std::string_view line) {
    try {
        return textOfReply(carryOut(line));
    } catch (const CommandError& error) {
        return textOfReply(failure(error));
    }
}

std::string Interpreter::replyToTooLongLine(std::size_t limit) {
    return textOfReply(
        failure(CommandError("the line is not taken: it is longer than " + std::to_string(limit) +
                             " bytes; say it in several commands")));
}

Json Interpreter::carryOut(std::string_view line) {
    const nlohmann::json document = parse(line);
    Json results = perform(Field(&document, ""));
    runAndDraw();
    return success(stage_.trace->take(), std::move(results));
}

Json Interpreter::perform(const Field& command) {
    const Field name = command["do"];
    if (name.text() == "batch") {
        return {{"replies", performSteps(command["steps"])}};
    }
    Command known = situationCommand(name.text());
    known = known ? known : paneCommand(name.text());
    if (!known) {
        name.refuse("the name of a command; there is none of this name");
    }
    return known(stage_, command);
}

Json Interpreter::performSteps(const Field& steps) {
    Json replies = Json::array();
    for (const Field& step : steps.elements()) {
        replies.push_back(performStep(step));
    }
    return replies;
}

Json Interpreter::performStep(const Field& step) {
    try {
        Json results = perform(step);
        return success(stage_.trace->take(), std::move(results));
    } catch (const CommandError& error) {
        return failure(error);
    }
}

Json Interpreter::failure(const std::exception& error) {
    hasFailed_ = true;
    return {{"ok", false}, {"error", error.what()}};
}

/// What a command leaves to be done later is done before its reply.
void Interpreter::runAndDraw() {
    VirtualTime::shared().drain();
    stage_.panes.draw();
}

} // namespace quorl
