#pragma once

#include <QFont>
#include <QPainter>
#include <QStringList>
#include <optional>

namespace quorl {

/// The lines that a text takes in a width, without the spaces at which it was broken.
[[nodiscard]] QStringList wrappedLines(const QString& text, const QFont& font, qreal width);

/// The same, without a break within a word: null where there is a word that is too wide.
[[nodiscard]] std::optional<QStringList> linesOfWholeWords(const QString& text, const QFont& font,
                                                           qreal width);

/// The height of such lines.
[[nodiscard]] qreal heightOfLines(const QStringList& lines, const QFont& font);

/// Paints a text into `place`, wrapped, with the painter's font and pen. It begins at the right
/// edge in a right-to-left `direction`, whichever language it is written in.
void paintWrapped(QPainter& painter, const QString& text, const QRectF& place,
                  Qt::LayoutDirection direction);

} // namespace quorl
