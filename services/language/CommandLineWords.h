#pragma once

#include <functional>
#include <string>

namespace CLI {

class App;
class Validator;

} // namespace CLI

namespace quorl::language {

/// Has CLI11 tell its help and mistakes in the language that is followed. Names of options, and of
/// what they take, are the same in all languages. Before other options are added.
void wordCommandLine(CLI::App& app);

/// A check that lets pass what `rule` does.
/// @param mistake what to do about all else, to stand behind the name of the option.
[[nodiscard]] std::function<std::string(const std::string& value)>
wordedCheck(const CLI::Validator& rule, const std::string& mistake);

} // namespace quorl::language
