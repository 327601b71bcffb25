// ContrastStyle: the style of the application, with colours and edges that stand out.
#pragma once

#include <QHash>
#include <QPalette>
#include <QProxyStyle>
#include <QString>
#include <optional>
#include <utility>

namespace tendril {

// Corrects the application's palette. Over the Fusion style, it also draws the outlines of controls and the frames of
// group boxes in QPalette::Mid, and a line around what has the focus. Other styles draw as they do without it, but for
// buttons that pulse.
class ContrastStyle : public QProxyStyle {
  Q_OBJECT

 public:
  // Takes ownership of `base`. `system_style` is the name of the system's own style. With `dark`, the palette is that
  // theme's, otherwise the system's.
  ContrastStyle(QStyle* base, const QString& system_style, std::optional<bool> dark);

  const QString& SystemStyle() const { return system_style_; }

  using QProxyStyle::polish;
  void polish(QPalette& palette) override;
  void drawPrimitive(PrimitiveElement element, const QStyleOption* option, QPainter* painter,
                     const QWidget* widget) const override;
  void drawControl(ControlElement element, const QStyleOption* option, QPainter* painter,
                   const QWidget* widget) const override;
  void drawComplexControl(ComplexControl control, const QStyleOptionComplex* option, QPainter* painter,
                          const QWidget* widget) const override;

 private:
  // `palette` with a window colour of which the base style makes outlines in QPalette::Mid, with at
  // least this contrast.
  QPalette WithEdges(const QPalette& palette, int shade, double contrast) const;

  const QString system_style_;
  const std::optional<bool> dark_;
  const bool draws_edges_;
  // By the palette's cache key and the shade. The base style keeps its pixmaps by the cache key of these palettes.
  mutable QHash<std::pair<qint64, int>, QPalette> edged_;
};

}  // namespace tendril
