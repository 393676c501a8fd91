// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include <memory>
#include <string>
#include <vector>

#include "host/gtk/preview/document_view.h"
#include "host/gtk/preview/pages_canvas.h"
#include "host/gtk/preview/pages_gestures.h"
#include "host/gtk/preview/pages_indicator.h"
#include "host/gtk/preview/pages_pictures.h"
#include "host/gtk/preview/portable_document_password.h"
#include "host/gtk/preview/portable_document_source.h"

namespace vaelo {

/// The widgets of one portable document and what joins them. Main thread.
class PortableDocumentScreen {
 public:
  PortableDocumentScreen(const PreviewedDocument& document, DocumentViewEvents events);
  ~PortableDocumentScreen();
  PortableDocumentScreen(const PortableDocumentScreen&) = delete;
  PortableDocumentScreen& operator=(const PortableDocumentScreen&) = delete;
  GtkWidget* widget() const { return stack_; }

  void refresh();
  std::vector<GtkWidget*> headerWidgets();
  bool toggleFind();
  bool closeFind();

  PagesCanvas& canvas() { return canvas_; }

 private:
  void load(const std::string& password);
  void opened(const PortableDocumentSource::Opened& opened, const std::string& password);
  void askForSizes(std::size_t known);
  void moved();
  void draw(GtkSnapshot* snapshot, int page, const PageArea& area);
  void drawProblem(GtkSnapshot* snapshot, const std::string& problem, const PageArea& area);
  void pictureArrived();

  PreviewedDocument document_;
  DocumentViewEvents events_;
  PagesCanvas canvas_;
  GtkWidget* stack_;
  GtkWidget* scrolled_;
  PagesGestures gestures_;
  PagesIndicator indicator_;
  PortableDocumentPassword password_;
  std::unique_ptr<PortableDocumentSource> source_;
  std::unique_ptr<PagesPictures> pictures_;
  std::unique_ptr<PortableDocumentSource> nextSource_;  // while the document is read anew
  bool shown_ = false;
};

}  // namespace vaelo
