// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_graphics.h"

#include <sstream>

#include "tests/support/memory_image.h"

namespace vaelo {

namespace {

/// Writes each operation as "name number number ...".
class RecordedDrawing : public DrawingContext {
 public:
  std::vector<std::string> operations;

  void setFillColor(const Color& color) override { note("fillColor", {color.red, color.green, color.blue, color.alpha}); }
  void setStrokeColor(const Color& color) override {
    note("strokeColor", {color.red, color.green, color.blue, color.alpha});
  }
  void setLineWidth(double points) override { note("lineWidth", {points}); }
  void fillRect(const Rect& rect) override { note("fillRect", numbers(rect)); }
  void fillEllipse(const Rect& rect) override { note("fillEllipse", numbers(rect)); }
  void strokeEllipse(const Rect& rect) override { note("strokeEllipse", numbers(rect)); }
  void fillWedge(const Point& center, double radius, double startAngle, double endAngle) override {
    note("fillWedge", {center.x, center.y, radius, startAngle, endAngle});
  }
  void drawImage(const ImageRef&, const Rect& rect) override { note("image", numbers(rect)); }

 private:
  static std::vector<double> numbers(const Rect& rect) { return {rect.x, rect.y, rect.width, rect.height}; }
  void note(const char* name, const std::vector<double>& values) {
    std::ostringstream text;
    text << name;
    for (const double value : values) text << ' ' << value;
    operations.push_back(text.str());
  }
};

}  // namespace

FontMetrics MemoryGraphics::fontMetrics(const Font& font) {
  const double size = font.pointSize;
  return {
      .pointSize = size, .ascender = size * 0.75, .descender = size * -0.25, .capHeight = size * 0.5, .lineHeight = size};
}

Size MemoryGraphics::measure(const std::string& text, const Font& font, double, int) {
  return {static_cast<double>(text.size()) * 5, text.empty() ? 0 : font.pointSize};
}

ImageRef MemoryGraphics::renderImage(const Size& size, const std::function<void(DrawingContext&)>& draw) {
  RecordedDrawing drawing;
  draw(drawing);
  return std::make_shared<MemoryImage>(size, std::move(drawing.operations));
}

ImageRef MemoryGraphics::documentIcon(const std::string& fileName, const std::optional<std::string>& typeIdentifier,
                                      IconFormat format) {
  const double side = format == IconFormat::Small ? 32 : 320;
  return std::make_shared<MemoryImage>(
      Size{side, side}, std::vector<std::string>{"icon " + fileName + " " + typeIdentifier.value_or("no type") + " " +
                                                 std::to_string(static_cast<int>(format))});
}

}  // namespace vaelo
