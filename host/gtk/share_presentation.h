// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>
#include <memory>
#include <optional>

#include "platform/ui/view.h"

namespace vaelo {

class GtkWindowHost;

/// Where a popover points to.
struct ShareAnchor {
  GtkWidget* widget = nullptr;          ///< the button that was pressed; null for none
  std::optional<graphene_rect_t> area;  ///< else a rectangle of the window's content
};

/// Where the rectangle of a view is in the window's content. A view that stands in no window has a frame there itself.
/// Nothing for an empty one.
std::optional<graphene_rect_t> areaOf(const Rect& rect, const ViewRef& view);

/// Shows a sheet over the window: on a narrow one it rises from the bottom edge, on a wide one it is a popover at its
/// anchor. Escape, a tap beside it, and on a narrow window a swipe down, take it away. Main thread.
class SharePresentation {
 public:
  /// `dismissed` is called once, after the sheet went, whoever took it away; not when the window ends first. `content` is
  /// taken over.
  SharePresentation(const std::shared_ptr<GtkWindowHost>& window, GtkWidget* content, const ShareAnchor& anchor,
                    std::function<void()> dismissed);
  ~SharePresentation();
  SharePresentation(const SharePresentation&) = delete;
  SharePresentation& operator=(const SharePresentation&) = delete;

  /// Takes the sheet away; `then` runs after `dismissed`. Without effect when it is gone already.
  void close(std::function<void()> then = nullptr);

 private:
  void riseFromBottom(GtkWidget* content);
  void pointAt(GtkWidget* content, const ShareAnchor& anchor);
  void drop();
  void gone();

  std::weak_ptr<GtkWindowHost> window_;
  std::function<void()> dismissed_;
  std::function<void()> then_;
  GtkWidget* overlay_;                // strong reference
  GtkWidget* flap_ = nullptr;         // strong reference
  GtkWidget* popover_ = nullptr;      // strong reference
  GtkWidget* focusBefore_ = nullptr;  // weak pointer
  unsigned ending_ = 0;               // idle source
  unsigned rising_ = 0;               // tick callback, until it has a size
};

}  // namespace vaelo
