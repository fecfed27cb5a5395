#include "quorl/window/cells/WrappedText.h"

#include <QCache>
#include <QFontMetricsF>
#include <QTextLayout>

namespace quorl {

namespace {

struct Lines {
    QStringList texts;
    qreal width = 0; ///< of the widest
};

Lines broken(const QString& text, const QFont& font, qreal width, QTextOption::WrapMode mode) {
    QTextOption option;
    option.setWrapMode(mode);
    QTextLayout layout(text, font);
    layout.setTextOption(option);
    layout.beginLayout();
    Lines lines;
    for (QTextLine line = layout.createLine(); line.isValid(); line = layout.createLine()) {
        line.setLineWidth(width);
        lines.texts << text.mid(line.textStart(), line.textLength()).trimmed();
        lines.width = std::max(lines.width, line.naturalTextWidth());
    }
    layout.endLayout();
    return lines;
}

struct Paragraph {
    QString text;
    QString font;
    /// Differs with the screen, too.
    qreal lineSpacing;
    qreal width;

    bool operator==(const Paragraph&) const = default;
};

std::size_t qHash(const Paragraph& paragraph, std::size_t seed) {
    return qHashMulti(seed, paragraph.text, paragraph.width);
}

} // namespace

QStringList wrappedLines(const QString& text, const QFont& font, qreal width) {
    // The same few are asked for again whenever something is laid out or painted.
    constexpr qsizetype most = 64;
    static QCache<Paragraph, QStringList> known(most);
    const Paragraph paragraph{text, font.key(), QFontMetricsF(font).lineSpacing(), width};
    if (const auto* lines = known.object(paragraph)) {
        return *lines;
    }
    auto lines = broken(text, font, width, QTextOption::WrapAtWordBoundaryOrAnywhere).texts;
    known.insert(paragraph, new QStringList(lines));
    return lines;
}

std::optional<QStringList> linesOfWholeWords(const QString& text, const QFont& font, qreal width) {
    auto lines = broken(text, font, width, QTextOption::WordWrap);
    return lines.width <= width ? std::optional(std::move(lines.texts)) : std::nullopt;
}

qreal heightOfLines(const QStringList& lines, const QFont& font) {
    return QFontMetricsF(font).lineSpacing() * static_cast<qreal>(lines.size());
}

void paintWrapped(QPainter& painter, const QString& text, const QRectF& place,
                  Qt::LayoutDirection direction) {
    const auto side = direction == Qt::RightToLeft ? Qt::AlignRight : Qt::AlignLeft;
    const int flags = static_cast<int>(side | Qt::AlignAbsolute | Qt::AlignTop) |
                      Qt::TextSingleLine | Qt::TextDontClip;
    const qreal lineHeight = QFontMetricsF(painter.font()).lineSpacing();
    QRectF line(place.left(), place.top(), place.width(), lineHeight);
    painter.setLayoutDirection(text.isRightToLeft() ? Qt::RightToLeft : Qt::LeftToRight);
    for (const QString& words : wrappedLines(text, painter.font(), place.width())) {
        painter.drawText(line, flags, words);
        line.translate(0, lineHeight);
    }
}

} // namespace quorl
