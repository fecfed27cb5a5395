#include "quorl/search/FoldedText.h"

namespace quorl {

QString folded(const QString& text) {
    QString letters = text.normalized(QString::NormalizationForm_KD);
    letters.removeIf([](QChar letter) { return letter.category() == QChar::Mark_NonSpacing; });
    return letters.toCaseFolded();
}

} // namespace quorl
