// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <adwaita.h>

#include <functional>
#include <string>

namespace vaelo {

/// The bar in which a person types what to find in a document: as one types, onwards with Enter and Ctrl+G, and back with
/// Shift; with a count of what was found. Main thread.
class FindBar {
 public:
  struct Events {
    std::function<void(const std::string& text)> changed;  ///< empty when nothing is to be found any more
    std::function<void(bool forward)> step;                ///< to the next or the previous place
  };

  /// `content` takes the focus when the bar closes; it outlives the bar.
  FindBar(GtkWidget* content, Events events);
  ~FindBar();
  FindBar(const FindBar&) = delete;
  FindBar& operator=(const FindBar&) = delete;
  GtkWidget* widget() const { return bar_; }

  void toggle();
  /// False when it is closed already.
  bool close();
  /// What is to be found; empty while the bar is closed.
  std::string text() const;
  void showCount(const std::string& count, bool nothingFound);

  // For tests.
  GtkWidget* entry() const { return entry_; }
  GtkWidget* count() const { return count_; }

 private:
  void textChanged();
  void step(bool forward);

  GtkWidget* content_;
  Events events_;
  std::string told_;  // the text that changed() was called with
  GtkWidget* bar_;
  GtkWidget* entry_;
  GtkWidget* count_;
};

/// A button for the header bar that opens the find bar; `activated` gets `data`.
GtkWidget* makeFindButton(GCallback activated, gpointer data);

}  // namespace vaelo
