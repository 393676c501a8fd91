// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/picture_viewport.h"

#include <algorithm>
#include <cmath>

namespace vaelo {

namespace {

constexpr double LargestMagnification = 20;
constexpr double SameScale = 1.001;

// The middle where all of a side is seen, else no further than its edge.
double insideOne(double centre, double length, double seen) {
  return seen >= length ? length / 2 : std::clamp(centre, seen / 2, length - seen / 2);
}

}  // namespace

bool PictureViewport::Area::covers(const Area& other) const {
  constexpr double nothing = 0.01;
  return x <= other.x + nothing && y <= other.y + nothing && x + width >= other.x + other.width - nothing &&
         y + height >= other.y + other.height - nothing;
}

void PictureViewport::setPicture(Size picture, bool grows) {
  const bool isSame = picture.width == picture_.width && picture.height == picture_.height;
  picture_ = picture;
  grows_ = grows;
  if (!isSame || isFitting_) fit();
}

void PictureViewport::setWindow(Size window) {
  window_ = window;
  isFitting_ || scale_ < fitScale() ? fit() : keepInside();
}

double PictureViewport::fitScale() const {
  if (picture_.width <= 0 || picture_.height <= 0 || window_.width <= 0 || window_.height <= 0) return 1;
  const double scale = std::min(window_.width / picture_.width, window_.height / picture_.height);
  return grows_ ? scale : std::min(scale, 1.0);
}

double PictureViewport::largestScale() const { return std::max(1.0, fitScale()) * LargestMagnification; }

double PictureViewport::closerScale() const { return std::clamp(1.0, fitScale() * 2, fitScale() * 4); }

bool PictureViewport::canPan() const {
  constexpr double hairline = 0.5;
  return picture_.width * scale_ > window_.width + hairline || picture_.height * scale_ > window_.height + hairline;
}

void PictureViewport::fit() {
  isFitting_ = true;
  scale_ = fitScale();
  centre_ = {picture_.width / 2, picture_.height / 2};
}

void PictureViewport::zoom(double scale, Point at) {
  scale = std::clamp(scale, fitScale(), largestScale());
  if (scale <= fitScale() * SameScale) return fit();
  isFitting_ = false;
  const double right = at.x - window_.width / 2;
  const double below = at.y - window_.height / 2;
  centre_.x += right / scale_ - right / scale;
  centre_.y += below / scale_ - below / scale;
  scale_ = scale;
  keepInside();
}

bool PictureViewport::pan(double dx, double dy) {
  const Point before = centre_;
  centre_ = {centre_.x - dx / scale_, centre_.y - dy / scale_};
  keepInside();
  return centre_.x != before.x || centre_.y != before.y;
}

void PictureViewport::keepInside() {
  centre_ = {insideOne(centre_.x, picture_.width, window_.width / scale_),
             insideOne(centre_.y, picture_.height, window_.height / scale_)};
}

PictureViewport::Area PictureViewport::pictureArea() const {
  return {window_.width / 2 - centre_.x * scale_, window_.height / 2 - centre_.y * scale_, picture_.width * scale_,
          picture_.height * scale_};
}

PictureViewport::Area PictureViewport::visiblePart() const {
  const double left = std::max(0.0, centre_.x - window_.width / scale_ / 2);
  const double top = std::max(0.0, centre_.y - window_.height / scale_ / 2);
  const double right = std::min(picture_.width, centre_.x + window_.width / scale_ / 2);
  const double bottom = std::min(picture_.height, centre_.y + window_.height / scale_ / 2);
  return {left, top, std::max(0.0, right - left), std::max(0.0, bottom - top)};
}

}  // namespace vaelo
