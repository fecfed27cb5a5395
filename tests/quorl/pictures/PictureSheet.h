#pragma once

#include <QImage>
#include <filesystem>

namespace quorl::tests {

/// Pictures of one size side by side, in rows, compared with those that somebody has looked at and
/// found right.
class PictureSheet {
  public:
    /// @param name of the accepted sheet, `docs/pictures/<name>.png`.
    /// @param size of each picture, in pixels.
    PictureSheet(std::string name, QSize size);

    void add(const QImage& picture);

    /// What is not as it was accepted, in a sentence that says how to accept it; empty where the
    /// sheets are alike. What differs can be seen in a file that the sentence names. Where the
    /// environment has `QUORL_ACCEPT_PICTURES`, the sheet is accepted instead.
    [[nodiscard]] std::string difference() const;

  private:
    [[nodiscard]] QImage sheet() const;
    [[nodiscard]] QRect place(qsizetype index) const;

    const std::string name_;
    const QSize size_;
    QList<QImage> pictures_;
};

} // namespace quorl::tests
