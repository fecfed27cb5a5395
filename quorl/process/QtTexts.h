#pragma once

#include <QTranslator>

namespace quorl {

/// Gives Qt the app's texts in the language that is followed. Main thread.
class QtTexts final : public QTranslator {
    Q_OBJECT

  public:
    using QTranslator::QTranslator;

    [[nodiscard]] QString translate(const char* context, const char* text,
                                    const char* disambiguation, int count) const override;

    [[nodiscard]] bool isEmpty() const override { return false; }
};

} // namespace quorl
