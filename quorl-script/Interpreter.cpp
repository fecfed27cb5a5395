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
JsonObject success(const JsonList& trace, const JsonObject& results) {
    return JsonObject().set("ok", true).set("trace", trace).setAll(results);
}

} // namespace

std::string Interpreter::reply(std::string_view line) {
    try {
        return carryOut(line).text();
    } catch (const CommandError& error) {
        return failure(error).text();
    }
}

std::string Interpreter::replyToTooLongLine(std::size_t limit) {
    return failure(CommandError("the line is not taken: it is longer than " +
                                std::to_string(limit) + " bytes; say it in several commands"))
        .text();
}

JsonObject Interpreter::carryOut(std::string_view line) {
    const nlohmann::json document = parse(line);
    const JsonObject results = perform(Field(&document, ""));
    runAndDraw();
    return success(stage_.trace->take(), results);
}

JsonObject Interpreter::perform(const Field& command) {
    const Field name = command["do"];
    if (name.text() == "batch") {
        return JsonObject().set("replies", performSteps(command["steps"]));
    }
    Command known = situationCommand(name.text());
    known = known ? known : paneCommand(name.text());
    if (!known) {
        name.refuse("the name of a command; there is none of this name");
    }
    return known(stage_, command);
}

JsonList Interpreter::performSteps(const Field& steps) {
    JsonList replies;
    for (const Field& step : steps.elements()) {
        replies.add(performStep(step));
    }
    return replies;
}

JsonObject Interpreter::performStep(const Field& step) {
    try {
        const JsonObject results = perform(step);
        return success(stage_.trace->take(), results);
    } catch (const CommandError& error) {
        return failure(error);
    }
}

JsonObject Interpreter::failure(const std::exception& error) {
    hasFailed_ = true;
    return JsonObject().set("ok", false).set("error", error.what());
}

/// What a command leaves to be done later is done before its reply.
void Interpreter::runAndDraw() {
    VirtualTime::shared().drain();
    stage_.panes.draw();
}

} // namespace quorl
