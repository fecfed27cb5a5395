#include "quorl/window/rows/RowFades.h"

namespace quorl {

namespace {

constexpr int fadeDuration = 250; // milliseconds

} // namespace

RowFades::RowFades() : fade_(fadeDuration) {
    connect(&fade_, &QVariantAnimation::valueChanged, this, &RowFades::tellChanges);
    connect(&fade_, &QVariantAnimation::finished, this, &RowFades::end);
}

void RowFades::tellChanges() {
    for (const auto& [row, picture] : pictures_) {
        Q_EMIT changed(row);
    }
}

void RowFades::end() {
    tellChanges();
    pictures_.clear();
    fade_.stop();
}

void RowFades::paint(QPainter& painter, const RowsLayout& layout) const {
    painter.save();
    painter.setOpacity(fade_.share());
    for (const auto& [row, picture] : pictures_) {
        const QRectF place = layout.rowRect(row);
        if (!place.isEmpty()) {
            painter.drawPixmap(place.topLeft(), picture);
        }
    }
    painter.restore();
}

} // namespace quorl
