#include "tests/quorl/pictures/PictureSheet.h"

#include <QPainter>
#include <algorithm>
#include <cstdlib>

namespace quorl::tests {

namespace {

constexpr qsizetype columns = 5;

/// Edges are smoothed a little differently by each machine; the smallest letter is more than that.
constexpr int mostOfOnePixel = 48;
constexpr int mostPixels = 8;

bool isOther(QRgb one, QRgb other) {
    return std::max({std::abs(qRed(one) - qRed(other)), std::abs(qGreen(one) - qGreen(other)),
                     std::abs(qBlue(one) - qBlue(other))}) > mostOfOnePixel;
}

/// In how many pixels two pictures of one size differ.
int differing(const QImage& one, const QImage& other) {
    int count = 0;
    for (int y = 0; y < one.height(); ++y) {
        for (int x = 0; x < one.width(); ++x) {
            count += isOther(one.pixel(x, y), other.pixel(x, y)) ? 1 : 0;
        }
    }
    return count;
}

} // namespace

PictureSheet::PictureSheet(std::string name, QSize size) : name_(std::move(name)), size_(size) {}

void PictureSheet::add(const QImage& picture) { pictures_.push_back(picture); }

QRect PictureSheet::place(qsizetype index) const {
    const QPoint cell(static_cast<int>(index % columns), static_cast<int>(index / columns));
    return {QPoint(cell.x() * size_.width(), cell.y() * size_.height()), size_};
}

QImage PictureSheet::sheet() const {
    const auto rows = (pictures_.size() + columns - 1) / columns;
    QImage sheet(static_cast<int>(std::min(columns, pictures_.size())) * size_.width(),
                 static_cast<int>(rows) * size_.height(), QImage::Format_RGB32);
    sheet.fill(Qt::gray);
    QPainter painter(&sheet);
    for (qsizetype index = 0; index < pictures_.size(); ++index) {
        painter.drawImage(place(index), pictures_[index]);
    }
    return sheet;
}

std::string PictureSheet::difference() const {
    const auto now = sheet();
    const auto accepted =
        QStringLiteral(SOURCE_DIRECTORY "/docs/pictures/%1.png").arg(QString::fromStdString(name_));
    if (qEnvironmentVariableIsSet("QUORL_ACCEPT_PICTURES")) {
        return now.save(accepted) ? "" : accepted.toStdString() + " cannot be written";
    }
    const auto before = QImage(accepted).convertToFormat(QImage::Format_RGB32);
    std::string numbers;
    for (qsizetype index = 0; index < pictures_.size(); ++index) {
        const bool isSame =
            before.size() == now.size() &&
            differing(now.copy(place(index)), before.copy(place(index))) <= mostPixels;
        numbers += isSame ? "" : " " + std::to_string(index + 1);
    }
    if (numbers.empty()) {
        return {};
    }
    const auto file = "differs-" + name_ + ".png";
    return now.save(QString::fromStdString(file))
               ? "Not as accepted:" + numbers + ". Look at " +
                     std::filesystem::absolute(file).string() +
                     "; if it is right, accept it with tools/accept-pictures."
               : file + " cannot be written";
}

} // namespace quorl::tests
