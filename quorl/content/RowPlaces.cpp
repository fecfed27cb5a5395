#include "quorl/content/RowPlaces.h"

namespace quorl {

namespace {

/// How far a row is looked for from where it was: each step asks the pane for two rows.
constexpr NSInteger reach = 200;

} // namespace

std::optional<std::string> RowPlaces::nameOf(NSInteger row) const {
    const auto cell = content_.cellAnywhere(row);
    return cell ? std::optional(cell->textLabel().text().value_or("")) : std::nullopt;
}

std::size_t RowPlaces::sectionOf(NSInteger row) const {
    std::size_t number = 0;
    for (const auto& section : content_.sections()) {
        if (row < section.rowCount) {
            break;
        }
        row -= section.rowCount;
        ++number;
    }
    return number;
}

std::optional<RowPlaces::Identity> RowPlaces::identityOf(NSInteger row) const {
    auto name = nameOf(row);
    if (!name) {
        return std::nullopt;
    }
    Identity identity{sectionOf(row), std::move(*name), 0};
    while (identity.ordinal < reach && sectionOf(row - 1 - identity.ordinal) == identity.section &&
           nameOf(row - 1 - identity.ordinal) == identity.name) {
        ++identity.ordinal;
    }
    return identity;
}

void RowPlaces::note(NSInteger firstOnScreen, NSInteger current) {
    onScreen_.clear();
    for (NSInteger row = firstOnScreen; content_.cell(row); ++row) {
        onScreen_.push_back({row, *identityOf(row)});
    }
    const bool isKnown = current_ && current_->row == current && !content_.cell(current);
    if (auto identity = isKnown ? std::nullopt : identityOf(current)) {
        current_ = Place{current, std::move(*identity)};
    }
}

bool RowPlaces::isAt(NSInteger row, const Identity& identity) const {
    return nameOf(row) == identity.name && identityOf(row) == identity;
}

std::optional<NSInteger> RowPlaces::find(const Place& place) const {
    for (NSInteger distance = 0; distance <= reach; ++distance) {
        for (const NSInteger row : {place.row + distance, place.row - distance}) {
            if (isAt(row, place.identity)) {
                return row;
            }
        }
    }
    return std::nullopt;
}

std::optional<RowPlaces::Move> RowPlaces::moveOnScreen() const {
    for (const Place& place : onScreen_) {
        if (const auto row = find(place)) {
            return Move{place.row, *row};
        }
    }
    return std::nullopt;
}

std::optional<NSInteger> RowPlaces::placeOfCurrent() const {
    return current_ ? find(*current_) : std::nullopt;
}

} // namespace quorl
