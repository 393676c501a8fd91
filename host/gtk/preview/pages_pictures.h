// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <map>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/portable_document_source.h"

namespace vaelo {

/// The pictures of the pages that are looked at, made one after the other in the order of their importance. A page too large
/// for one picture at the wanted scale has a coarser one, and a sharp one of what is visible. Main thread.
class PagesPictures {
 public:
  /// A page that is, or soon will be, looked at.
  struct Wanted {
    int page = 0;
    PageSize size;
    std::optional<PageArea> visible;  ///< the part of it, in points
  };

  PagesPictures(PortableDocumentSource& source, std::function<void()> arrived)
      : source_(source), arrived_(std::move(arrived)) {}
  ~PagesPictures();
  PagesPictures(const PagesPictures&) = delete;
  PagesPictures& operator=(const PagesPictures&) = delete;

  /// What is wanted now, the most important first, at so many pixels a point.
  void want(std::vector<Wanted> wanted, double scale);
  /// From now on pages are painted without these marks of the file, and no others. Until then they look as they did.
  void hide(const std::map<int, std::vector<int>>& marks);
  /// Draws what there is of the page; false when there is nothing yet.
  bool draw(GtkSnapshot* snapshot, int page, const PageArea& area) const;
  /// Why there will be no picture of the page; empty when nothing speaks against it.
  std::string problemOf(int page) const;

 private:
  struct Picture {
    GRef<GdkTexture> texture;
    double scale = 0;
    PixelRect rect;
  };
  struct Page {
    Picture whole;
    Picture detail;
    std::string problem;
    std::vector<int> hidden;  // marks
    int version = 0;          // counts what was hidden
    bool isOld = false;       // the whole shows what is hidden by now, or lacks what isn't
  };
  struct Request {
    int page = 0;
    double scale = 0;
    PixelRect rect;
    bool detail = false;
  };

  std::optional<Request> mostImportant();
  std::optional<Request> detailFor(const Wanted& wanted);
  void next();
  void received(const Request& request, int version, DecoderProcess::Answer answer);
  void forgetFarPages();

  PortableDocumentSource& source_;
  std::function<void()> arrived_;
  std::map<int, Page> pages_;
  std::vector<Wanted> wanted_;
  double scale_ = 1;
  bool zooming_ = false;
  guint quiet_ = 0;
  bool asking_ = false;
};

}  // namespace vaelo
