// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

namespace vaelo {

/// Which part of a picture is seen, and how large. Lengths in the window are logical pixels; those of the picture its own.
class PictureViewport {
 public:
  struct Size {
    double width = 0;
    double height = 0;
  };
  struct Point {
    double x = 0;
    double y = 0;
  };
  struct Area {
    double x = 0;
    double y = 0;
    double width = 0;
    double height = 0;
    bool covers(const Area& other) const;
  };

  /// `grows`: fills the window at first even if it is smaller, since it is sharp at any size.
  void setPicture(Size picture, bool grows);
  /// What is in the middle stays there; what fits into the window goes on to.
  void setWindow(Size window);

  Size picture() const { return picture_; }
  Size window() const { return window_; }
  /// Logical pixels of the window for each of the picture.
  double scale() const { return scale_; }
  /// The scale at which all of the picture is seen.
  double fitScale() const;
  double largestScale() const;
  /// What a double tap goes to from the fitting scale.
  double closerScale() const;
  bool isFitting() const { return isFitting_; }
  /// True when something is out of sight.
  bool canPan() const;

  void fit();
  /// Changes the scale within its bounds; what is at the point of the window stays there where that can be.
  void zoom(double scale, Point at);
  /// Moves the picture by so much, as far as it goes; false when it doesn't go at all.
  bool pan(double dx, double dy);

  /// Where the picture is in the window.
  Area pictureArea() const;
  /// What is seen of the picture.
  Area visiblePart() const;

 private:
  void keepInside();

  Size picture_;
  Size window_;
  Point centre_;  // of the window, in the picture
  double scale_ = 1;
  bool grows_ = false;
  bool isFitting_ = true;
};

}  // namespace vaelo
