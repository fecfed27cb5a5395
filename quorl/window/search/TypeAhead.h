#pragma once

#include <QString>

namespace quorl {

/// The beginning of a name that a person types without a field to type it into. Letters that come
/// soon after each other belong together. Main thread.
class TypeAhead {
  public:
    /// Takes letters that were typed at a time, in milliseconds of the clock of input events.
    void type(const QString& letters, std::uint64_t time);

    /// Whether letters at that time belong to those before them.
    [[nodiscard]] bool isUnderWay(std::uint64_t time) const;

    /// What has been typed, folded.
    [[nodiscard]] const QString& beginning() const { return beginning_; }

    /// Whether the last letters were the first of a name.
    [[nodiscard]] bool isNew() const { return isNew_; }

  private:
    QString beginning_;
    std::uint64_t lastTime_ = 0;
    bool isNew_ = true;
};

} // namespace quorl
