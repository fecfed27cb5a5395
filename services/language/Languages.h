#pragma once

#include <filesystem>
#include <string>
#include <vector>

/// The texts and numbers of this program, in the language of whoever reads them.
namespace quorl::language {

/// Takes the first of `wished` that there are texts in, else English, for everything that this
/// process says from now on. A language is named as in "de_AT" or "de"; of a regional one that has
/// no texts of its own, those of the language are taken.
///
/// @param catalogues where there is `<language>/LC_MESSAGES/quorl.mo`; empty for beside the running
/// program (`../share/locale`).
///
/// Before other threads are started: it sets `LANGUAGE`, which gettext goes by.
void followLanguages(const std::vector<std::string>& wished,
                     const std::filesystem::path& catalogues = {});

/// What the environment says of the user's languages, by gettext's rules: the preferred one first.
[[nodiscard]] std::vector<std::string> usersLanguages();

/// What is followed: first the language that texts and digits are in, then those that were wished
/// for behind it. "en" before anything was followed. Never empty.
[[nodiscard]] const std::vector<std::string>& followedLanguages();

} // namespace quorl::language
