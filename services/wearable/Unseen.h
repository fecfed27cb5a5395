#pragma once

#include <array>
#include <stdexcept>
#include <string>
#include <string_view>

#include "services/language/CodedMessage.h"

namespace quorl::wearable {

/// Why a wearable could not be looked at.
struct Unseen {
    /// For the user: one of `unseen`, or "other" with a sentence.
    language::CodedMessage message;
    /// It has not answered in time; it may be there all the same.
    bool isSilence = false;

    bool operator==(const Unseen&) const = default;
};

/// The codes of what is the matter with a wearable that cannot be looked at, and their arguments.
namespace unseen {

inline constexpr auto unreachable = "wearable-unreachable"; ///< its path, what the system says
inline constexpr auto silent = "wearable-silent";
inline constexpr auto noThreads = "no-threads";
inline constexpr auto badManifest = "bad-manifest"; ///< what is wrong with it
inline constexpr auto notPluggedIn = "not-plugged-in";
inline constexpr auto otherDrive = "other-drive"; ///< where it is, its name; no name for none

inline constexpr std::array<std::string_view, 6> all{unreachable, silent,       noThreads,
                                                     badManifest, notPluggedIn, otherDrive};

} // namespace unseen

/// What a look at a wearable ends with that cannot be done.
class CannotBeSeen : public std::runtime_error {
  public:
    /// @param message as in `Unseen`.
    /// @param words the same in English.
    CannotBeSeen(language::CodedMessage message, const std::string& words)
        : std::runtime_error(words), message_(std::move(message)) {}

    [[nodiscard]] const language::CodedMessage& message() const { return message_; }

  private:
    language::CodedMessage message_;
};

} // namespace quorl::wearable
