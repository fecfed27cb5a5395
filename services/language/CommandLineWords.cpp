#include "services/language/CommandLineWords.h"

#include <algorithm>
#include <array>
#include <memory>
#include <string_view>
#include <vector>

#include <CLI/CLI.hpp>

#include "services/language/Translated.h"

namespace quorl::language {

namespace {

struct Mistake {
    CLI::ExitCodes kind;
    /// Of one option, or two; or of what is none.
    const char* sentence;
};

constexpr std::array mistakes{
    Mistake{CLI::ExitCodes::ArgumentMismatch, toTranslate("{option} wants exactly one value.")},
    Mistake{CLI::ExitCodes::ConversionError,
            toTranslate("{option} does not take the value that it was given.")},
    Mistake{CLI::ExitCodes::ExcludesError, toTranslate("{option} does not go with {other}.")},
    Mistake{CLI::ExitCodes::ExtrasError, toTranslate("{argument} was not expected.")},
    Mistake{CLI::ExitCodes::RequiresError, toTranslate("{option} goes only with {other}.")},
};

/// An error has no more of its options than their names in its English text.
std::vector<std::string> optionsIn(std::string_view text) {
    std::vector<std::string> options;
    for (auto at = text.find("--"); at != std::string_view::npos; at = text.find("--", at)) {
        text.remove_prefix(at);
        at = std::min(text.find_first_of(": "), text.size());
        options.emplace_back(text.substr(0, at));
    }
    return options;
}

std::string firstLeftOver(const CLI::App& app) {
    const auto left = app.remaining();
    return left.empty() ? "" : filled(translated("“{name}”"), {{"name", left.front()}});
}

/// What is told by `wordedCheck`, and by the program itself, is in the right words already.
std::string sentenceOf(const CLI::App& app, const CLI::Error& error) {
    const auto kind = static_cast<CLI::ExitCodes>(error.get_exit_code());
    const auto* const mistake = std::ranges::find(mistakes, kind, &Mistake::kind);
    if (mistake == mistakes.end()) {
        return error.what();
    }
    auto options = optionsIn(error.what());
    options.resize(2);
    return filled(
        translated(mistake->sentence),
        {{"option", options[0]}, {"other", options[1]}, {"argument", firstLeftOver(app)}});
}

/// Names what an option takes. What it does not go with would be most of the text; a mistake tells.
class Help final : public CLI::Formatter {
    [[nodiscard]] std::string make_option_opts(const CLI::Option* option) const override {
        return option->get_type_size() == 0 ? "" : ' ' + option->get_type_name();
    }
};

std::string failure(const CLI::App* app, const CLI::Error& error) {
    const auto program = app->get_name();
    return program + ": " + sentenceOf(*app, error) + '\n' +
           filled(translated("Run \"{program} --help\" for the options."), {{"program", program}}) +
           '\n';
}

} // namespace

void wordCommandLine(CLI::App& app) {
    const auto help = std::make_shared<Help>();
    for (const auto* const label : {toTranslate("Usage"), toTranslate("OPTIONS")}) {
        help->label(label, translated(label));
    }
    app.formatter(help);
    app.option_defaults()->group(translated("Options"));
    app.set_help_flag("-h,--help", translated("Print this help and end"));
    app.failure_message(failure);
}

std::function<std::string(const std::string& value)> wordedCheck(const CLI::Validator& rule,
                                                                 const std::string& mistake) {
    return [rule, mistake](const std::string& value) {
        return rule(value).empty() ? std::string() : mistake;
    };
}

} // namespace quorl::language
