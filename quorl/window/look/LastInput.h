#pragma once

#include <QObject>

namespace quorl {

/// Whether a person used keys last, or a pointer: a finger, a mouse or a pen. Whoever uses keys
/// sees where they act. Watches the whole application. Main thread.
class LastInput final : public QObject {
    Q_OBJECT

  public:
    enum class Kind { Pointer, Keys };

    LastInput();

    /// A pointer, until a key is used.
    [[nodiscard]] Kind kind() const { return kind_; }

    bool eventFilter(QObject* watched, QEvent* event) override;

  Q_SIGNALS:
    void changed();

  private:
    Kind kind_ = Kind::Pointer;
};

} // namespace quorl
