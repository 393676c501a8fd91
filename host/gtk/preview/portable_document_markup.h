// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/gtk/preview/mark_popover.h"
#include "host/gtk/preview/markup_bar.h"
#include "host/gtk/preview/note_popover.h"
#include "host/gtk/preview/pages_canvas.h"
#include "host/gtk/preview/pages_overlays.h"
#include "host/gtk/preview/pages_selection.h"

namespace vaelo {

/// What a person does to a portable document with the tools for marks. Main thread.
class PortableDocumentMarkup {
 public:
  struct Events {
    std::function<bool()> shouldSave;                       ///< asked before each mark
    std::function<void(const std::string& sentence)> tell;  ///< also after this object is gone
    std::function<void()> toolChosen;
    std::function<void()> changed;  ///< other marks, of the file too
    std::function<void()> settled;  ///< nothing is being saved any more
  };

  /// Popovers belong to `host`, no stack, which like the canvas outlives this object.
  PortableDocumentMarkup(PagesCanvas& canvas, GtkWidget* host, Events events);
  ~PortableDocumentMarkup();
  PortableDocumentMarkup(const PortableDocumentMarkup&) = delete;
  PortableDocumentMarkup& operator=(const PortableDocumentMarkup&) = delete;
  MarkupBar& bar() { return bar_; }

  /// Begins anew with this document, which can be marked; what was marked on the one before is saved.
  void begin(PortableDocumentMarks::Document document);
  /// There is no document to be marked; what was marked is saved.
  void end();
  bool mayMark() const { return marks_ != nullptr; }
  bool isSaving() const { return marks_ && marks_->state() == PortableDocumentMarks::State::Saving; }
  /// Marks wait to be saved, or could not be saved.
  bool isUnsaved() const;
  /// True when what stands at the path was saved here.
  bool wrote(const std::string& path) const { return marks_ && marks_->wrote(path); }

  MarkTool tool() const { return bar_.tool(); }
  /// Marks lines of text on a page. False when it may not be.
  bool highlight(int page, std::vector<PageRect> lines);
  /// Draws from and to places on the canvas.
  void press(double x, double y);
  void drag(double x, double y);
  void release(bool cancelled);
  void askForNote(double x, double y);
  bool undo();
  void draw(const PageOverlay& overlay, int page) const;
  /// The uppermost mark of this time within some points of the place; null when there is none.
  const PageMark* markAt(const PagePlace& place, double reach) const;
  /// Shows what can be done to a mark that was touched, also one of the file, at a place of the host.
  void offer(PageMark mark, const GdkRectangle& pointed);

  const PortableDocumentMarks* marks() const { return marks_.get(); }
  NotePopover& note() { return note_; }
  MarkPopover& popover() { return popover_; }

 private:
  bool add(std::vector<PageMark> marks);
  void rewrite(const PageMark& mark, const GdkRectangle& pointed);
  bool maySave();
  void changed();
  std::array<double, 2> placeOn(int page, double x, double y) const;

  PagesCanvas& canvas_;
  GtkWidget* host_;
  Events events_;
  MarkupBar bar_;
  NotePopover note_;
  MarkPopover popover_;
  std::shared_ptr<PortableDocumentMarks> marks_;
  std::optional<PageMark> stroke_;  // while it is drawn
};

}  // namespace vaelo
