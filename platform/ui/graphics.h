// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <optional>
#include <string>

#include "platform/image.h"
#include "platform/ui/attributed_string.h"
#include "platform/ui/color.h"
#include "platform/ui/font.h"
#include "platform/ui/geometry.h"

namespace vaelo {

/// Where a view or an image is drawn; coordinates in points from the top left. Valid only during the call that gets it.
class DrawingContext {
 public:
  virtual ~DrawingContext() = default;
  virtual void setFillColor(const Color& color) = 0;
  virtual void setStrokeColor(const Color& color) = 0;
  /// 1 point at the start.
  virtual void setLineWidth(double points) = 0;
  virtual void fillRect(const Rect& rect) = 0;
  virtual void fillEllipse(const Rect& rect) = 0;
  /// The outline of the ellipse that fills `rect`.
  virtual void strokeEllipse(const Rect& rect) = 0;
  /// The piece of a pie from `startAngle` clockwise to `endAngle`, in radians; 0 points right, -pi/2 up.
  virtual void fillWedge(const Point& center, double radius, double startAngle, double endAngle) = 0;
  virtual void drawImage(const ImageRef& image, const Rect& rect) = 0;
};

/// Formats of document icons; the codes are those that the screens ask with.
enum class IconFormat { Small = 0, Large = 12 };

/// Text measuring, drawing into images, and icons. Main thread.
class Graphics {
 public:
  virtual ~Graphics() = default;
  virtual FontMetrics fontMetrics(const Font& font) = 0;
  /// The size that the text takes in at most `maxLines` lines (0: any number) of at most `maxWidth` points (0: no limit).
  virtual Size measure(const std::string& text, const Font& font, double maxWidth = 0, int maxLines = 1) = 0;
  /// A transparent image of `size` points, at the main screen's scale, with what `draw` drew in it.
  virtual ImageRef renderImage(const Size& size, const std::function<void(DrawingContext&)>& draw) = 0;
  /// The icon of documents of that name and type; a neutral one when neither is known. Never null.
  virtual ImageRef documentIcon(const std::string& fileName, const std::optional<std::string>& typeIdentifier,
                                IconFormat format) = 0;
};

}  // namespace vaelo
