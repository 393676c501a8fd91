// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <functional>

#include "host/gtk/preview/portable_document_marks.h"

namespace vaelo {

enum class MarkTool { None, Highlight, Ink, Note };

/// The tools for marks, above the pages while it is open. Main thread.
class MarkupBar {
 public:
  struct Events {
    std::function<void(MarkTool)> toolChosen;  ///< None when the one in use is put away
    std::function<void()> undo;
    std::function<void(bool open)> toggled;
  };

  explicit MarkupBar(Events events);
  ~MarkupBar();
  MarkupBar(const MarkupBar&) = delete;
  MarkupBar& operator=(const MarkupBar&) = delete;
  GtkWidget* widget() const { return revealer_; }

  bool isOpen() const { return gtk_revealer_get_reveal_child(GTK_REVEALER(revealer_)); }
  void open(bool open) { gtk_revealer_set_reveal_child(GTK_REVEALER(revealer_), open); }
  MarkTool tool() const { return tool_; }
  /// Puts the one in use away.
  void putToolAway() { choose(MarkTool::None); }
  void choose(MarkTool tool);
  void show(PortableDocumentMarks::State state, bool mayUndo);
  /// Whether the document can be marked at all.
  void offer(bool offered);
  /// A toggle for the header bar that opens and closes it, and shows while it is offered.
  GtkWidget* makeToggle() const;

 private:
  GtkWidget* makeTool(MarkTool tool, const char* label, const char* hint);
  void toolToggled(GtkToggleButton* button);

  Events events_;
  GtkWidget* revealer_;
  GtkWidget* tools_[3] = {};
  GtkWidget* undo_;
  GtkWidget* state_;
  MarkTool tool_ = MarkTool::None;
};

}  // namespace vaelo
