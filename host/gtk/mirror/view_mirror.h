// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <map>
#include <memory>
#include <vector>

#include "host/gtk/mirror/mirrored_content.h"
#include "platform/ui/scroll_view.h"

namespace vaelo {

class TextField;

/// Shows a tree of views: gives the root the room of its widget, lays out by constraints, puts a widget at the frame of
/// each view that shows something, and follows what changes. A scroll view below the root scrolls. Main thread.
class ViewMirror : public ViewObserver {
 public:
  explicit ViewMirror(ViewRef root);
  ~ViewMirror() override;
  ViewMirror(const ViewMirror&) = delete;
  ViewMirror& operator=(const ViewMirror&) = delete;
  /// Gives the keyboard to what scrolls, and so to nothing that could be changed by the first key.
  void takeFocus() { gtk_widget_grab_focus(scroller_); }
  GtkWidget* widget() const { return outer_; }

  void viewChanged(View& view, ViewChange change) override;
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override {}
  void viewWillBeDestroyed(View& view) override;

 private:
  struct Slot {
    View* view;
    std::unique_ptr<MirroredContent> content;
  };

  void follow();
  void follow(View& view, std::vector<std::unique_ptr<Slot>>& old);
  void allocate(int width, int height);
  void layOut();
  void place();
  void place(Slot& slot);
  void scrollToFocusUnlessRefused(TextField& field);
  void showOffset();
  void userScrolled();
  void tapped() const;
  int contentHeight() const;

  ViewRef root_;
  GtkWidget* outer_;
  GtkWidget* scroller_;
  GtkWidget* area_;
  GtkAdjustment* adjustment_;
  ScrollView* scroll_ = nullptr;
  std::vector<std::unique_ptr<Slot>> slots_;  // in the order in which the keyboard walks
  std::vector<View*> followed_;
  int height_ = 0;        // of what scrolls
  bool stale_ = true;     // the tree is another than the one that is followed
  bool changed_ = false;  // something asked for layout since it began
  bool placing_ = false;
};

}  // namespace vaelo
