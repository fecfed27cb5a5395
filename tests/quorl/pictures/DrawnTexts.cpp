#include "tests/quorl/pictures/DrawnTexts.h"

#include <QPaintEngine>

namespace quorl::tests {

namespace {

/// Keeps what is written, and draws nothing.
class Writing final : public QPaintEngine {
  public:
    Writing() : QPaintEngine(AllFeatures) {}

    bool begin(QPaintDevice* /*device*/) override { return true; }

    bool end() override { return true; }

    void updateState(const QPaintEngineState& now) override {
        if (now.state().testFlag(DirtyTransform)) {
            transform_ = now.transform();
        }
    }

    void drawTextItem(const QPointF& place, const QTextItem& item) override {
        const qreal left = transform_.map(place).x();
        texts_.append({item.text(), left, left + item.width()});
    }

    void drawPixmap(const QRectF& /*place*/, const QPixmap& /*pixmap*/,
                    const QRectF& /*part*/) override {}

    void drawPolygon(const QPointF* /*points*/, int /*count*/, PolygonDrawMode /*mode*/) override {}

    void drawPath(const QPainterPath& /*path*/) override {}

    [[nodiscard]] Type type() const override { return User; }

    [[nodiscard]] const QList<DrawnText>& texts() const { return texts_; }

  private:
    QTransform transform_;
    QList<DrawnText> texts_;
};

/// As large and as fine as a widget is.
class Sheet final : public QPaintDevice {
  public:
    explicit Sheet(const QWidget& widget) : widget_(widget) {}

    [[nodiscard]] QPaintEngine* paintEngine() const override { return &writing_; }

    [[nodiscard]] const QList<DrawnText>& texts() const { return writing_.texts(); }

  protected:
    [[nodiscard]] int metric(PaintDeviceMetric metric) const override {
        switch (metric) {
        case PdmWidth:
            return widget_.width();
        case PdmHeight:
            return widget_.height();
        case PdmDevicePixelRatio:
            return 1;
        case PdmDevicePixelRatioScaled:
            return static_cast<int>(devicePixelRatioFScale());
        case PdmDpiX:
        case PdmPhysicalDpiX:
            return widget_.logicalDpiX();
        case PdmDpiY:
        case PdmPhysicalDpiY:
            return widget_.logicalDpiY();
        default:
            return QPaintDevice::metric(metric);
        }
    }

  private:
    const QWidget& widget_;
    mutable Writing writing_;
};

} // namespace

QList<DrawnText> drawnTexts(QWidget& widget) {
    Sheet sheet(widget);
    widget.render(&sheet);
    return sheet.texts();
}

} // namespace quorl::tests
