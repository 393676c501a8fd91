// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <map>
#include <memory>
#include <vector>

#include "host/gtk/mirror/mirrored_content.h"
#include "platform/ui/view_observer.h"

namespace vaelo {

class StackView;

/// Shows a tree of views. All of them stand side by side in one widget, which the toolkit's constraint layout arranges, so
/// that a constraint may tie any view to any other; the frames that come out are reported to the model.
///
/// Changes of the model are taken over together, before the next frame is drawn. Main thread.
class ViewMirror : public ViewObserver {
 public:
  explicit ViewMirror(ViewRef root);
  ~ViewMirror() override;
  ViewMirror(const ViewMirror&) = delete;
  ViewMirror& operator=(const ViewMirror&) = delete;
  /// Owned by the mirror, which outlives what shows it.
  GtkWidget* widget() const { return area_; }

  void viewChanged(View& view, ViewChange change) override;
  void animationWillBegin(View&, const Animation&) override {}
  void animationDidEnd(View&) override { scheduleUpdate(); }
  void viewWillBeDestroyed(View& view) override;

 private:
  struct Node {
    GtkWidget* slot = nullptr;  // none for the root
    std::unique_ptr<MirroredContent> content;
    bool changed = false;
  };

  void scheduleUpdate();
  void update();
  void add(View& view);
  void drop(View& view);
  void keepOnly(const std::vector<View*>& present);
  void constrain();
  void constrainStack(StackView& stack);
  void constrainToFrame(View& view);
  void constrainToContent(View& view);
  void require(const View* first, GtkConstraintAttribute attribute, GtkConstraintRelation relation, const View* second,
               GtkConstraintAttribute secondAttribute, double multiplier, double constant, double priority);
  void tie(const LayoutConstraint& constraint);
  GtkConstraintTarget* targetOf(const View& view) const;
  bool rightToLeft() const;
  void allocated();
  bool report(View& view, const graphene_rect_t& above);
  void tapped();

  ViewRef root_;
  GtkWidget* field_;  // holds the slots
  GtkWidget* area_;
  GtkConstraintLayout* layout_ = nullptr;  // of field_, made anew with each set of constraints
  std::map<const View*, Node> nodes_;
  guint idle_ = 0;
  int passes_ = 0;  ///< layouts since the model changed by itself
  bool reporting_ = false;
};

}  // namespace vaelo
