#pragma once

#include "quorl/content/PaneContent.h"

namespace quorl {

/// Finds rows of a pane again after they were loaded anew. A pane gives its rows numbers, not
/// identities: what a person takes for the same row is the one of the same name in the same
/// section, and of several that follow each other under one name the same of them. Main thread.
class RowPlaces {
  public:
    /// `content` outlives the places.
    explicit RowPlaces(PaneContent& content) : content_(content) {}

    /// Notes what rows are now: those on the screen, and one more, each as far as there is such a
    /// row. One that is off the screen keeps what was noted of it last.
    void note(NSInteger firstOnScreen, NSInteger current);

    /// Has what is noted of the row `current` taken anew, wherever that is.
    void forgetCurrent() { current_.reset(); }

    /// Where the topmost of the rows on the screen that is still there was, and where it is now;
    /// null where none of them is near.
    struct Move {
        NSInteger from = 0;
        NSInteger to = 0;
    };

    [[nodiscard]] std::optional<Move> moveOnScreen() const;

    /// Where the row `current` is now; null where it is not near its place.
    [[nodiscard]] std::optional<NSInteger> placeOfCurrent() const;

  private:
    struct Identity {
        std::size_t section = 0;
        std::string name;
        NSInteger ordinal = 0; ///< among those of that name that follow each other

        [[nodiscard]] bool operator==(const Identity&) const = default;
    };

    struct Place {
        NSInteger row = 0;
        Identity identity;
    };

    [[nodiscard]] std::optional<std::string> nameOf(NSInteger row) const;
    [[nodiscard]] std::size_t sectionOf(NSInteger row) const;
    [[nodiscard]] std::optional<Identity> identityOf(NSInteger row) const;
    [[nodiscard]] bool isAt(NSInteger row, const Identity& identity) const;
    [[nodiscard]] std::optional<NSInteger> find(const Place& place) const;

    PaneContent& content_;
    std::vector<Place> onScreen_; ///< from top to bottom
    std::optional<Place> current_;
};

} // namespace quorl
