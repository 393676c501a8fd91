// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>
#include <string>
#include <vector>

#include "host/gtk/preview/document_buttons.h"
#include "host/gtk/preview/document_view.h"
#include "host/gtk/preview/find_bar.h"
#include "host/gtk/preview/link_popover.h"
#include "host/gtk/preview/pages_canvas.h"
#include "host/gtk/preview/pages_gestures.h"
#include "host/gtk/preview/pages_indicator.h"
#include "host/gtk/preview/pages_links.h"
#include "host/gtk/preview/pages_pictures.h"
#include "host/gtk/preview/pages_pointer.h"
#include "host/gtk/preview/pages_reading.h"
#include "host/gtk/preview/pages_selecting.h"
#include "host/gtk/preview/pages_texts.h"
#include "host/gtk/preview/portable_document_find.h"
#include "host/gtk/preview/portable_document_markup.h"
#include "host/gtk/preview/portable_document_password.h"
#include "host/gtk/preview/portable_document_source.h"
#include "host/gtk/preview/window_notice.h"

namespace vaelo {

/// The widgets of one portable document and what joins them. Main thread.
class PortableDocumentScreen {
 public:
  /// `coordination`, by which marks are saved, outlives all views; null does without.
  PortableDocumentScreen(const PreviewedDocument& document, DocumentViewEvents events,
                         FileCoordination* coordination = nullptr);
  ~PortableDocumentScreen();
  PortableDocumentScreen(const PortableDocumentScreen&) = delete;
  PortableDocumentScreen& operator=(const PortableDocumentScreen&) = delete;
  GtkWidget* widget() const { return stack_.get(); }

  void refresh();
  bool follow(const std::string& path, const std::string& name);
  bool wrote(const std::string& path) const { return markup_.wrote(path); }
  std::vector<GtkWidget*> headerWidgets();
  bool toggleFind();
  bool closeFind();

  // For tests.
  PagesCanvas& canvas() { return canvas_; }
  FindBar& findBar() { return findBar_; }
  PortableDocumentFind& find() { return find_; }
  PagesSelecting& selecting() { return selecting_; }
  PortableDocumentMarkup& markup() { return markup_; }
  /// As if a pointer did it.
  void press(double x, double y, int presses);
  void drag(double x, double y);
  void release(bool cancelled);
  void click(double x, double y);
  LinkPopover& linkPopover() { return linkPopover_; }

 private:
  bool key(guint key, GdkModifierType state);
  void longPress(double x, double y);
  void toolChosen();
  void beginMarkup(bool mayBeMarked);
  void showFound();
  void follow(const PageLink& link, const GdkRectangle& place);
  void askForMark(const PagePlace& place, const GdkRectangle& pointed);
  void marksChanged();
  void showName();
  void load(const std::string& password);
  void opened(const PortableDocumentSource::Opened& opened, const std::string& password);
  void askForSizes(std::size_t known);
  void moved();
  void draw(GtkSnapshot* snapshot, int page, const PageArea& area);
  void drawProblem(GtkSnapshot* snapshot, const std::string& problem, const PageArea& area);
  void pictureArrived();

  PreviewedDocument document_;
  DocumentViewEvents events_;
  FileCoordination* coordination_;
  PagesCanvas canvas_;
  GRef<GtkWidget> stack_;  // of the pages with their bars, and what asks for a password
  GtkWidget* pages_;
  GtkWidget* scrolled_;
  WindowNotice notice_;
  PagesGestures gestures_;
  FindBar findBar_;
  PortableDocumentFind find_;
  PagesSelecting selecting_;
  PortableDocumentMarkup markup_;
  LinkPopover linkPopover_;
  DocumentButtons buttons_;
  PagesPointer pointer_;
  PagesIndicator indicator_;
  PortableDocumentPassword password_;
  std::unique_ptr<PortableDocumentSource> source_;
  std::unique_ptr<PagesPictures> pictures_;
  std::unique_ptr<PagesTexts> texts_;
  PagesReading reading_;
  std::unique_ptr<PagesLinks> links_;
  std::unique_ptr<PortableDocumentSource> nextSource_;  // while the document is read anew
  bool shown_ = false;
  bool refreshWhenSaved_ = false;
  int clicks_ = 0;
  bool longPressed_ = false;  // by the finger that is still there
  double lastX_ = 0;          // where it pressed
  double lastY_ = 0;
};

}  // namespace vaelo
