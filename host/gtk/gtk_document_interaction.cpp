// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/gtk_document_interaction.h"

#include <algorithm>

#include "host/gtk/bar_item_widget.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/share_actions.h"

namespace vaelo {

namespace {

constexpr int HeightLeftFree = 120;  // what a sheet lies over stays in sight, and a tap beside it possible

}  // namespace

GtkDocumentInteraction::GtkDocumentInteraction(URL url, CloudDocuments& drive, std::weak_ptr<GtkWindowHost> window)
    : url_(std::move(url)), name_(url_.lastPathComponent()), drive_(drive), window_(std::move(window)) {}

GtkDocumentInteraction::~GtkDocumentInteraction() = default;

std::shared_ptr<ShareActions> GtkDocumentInteraction::makeActions(const std::shared_ptr<GtkWindowHost>& window) const {
  SharedItem item = describeSharedItem(url_, drive_);
  if (name_ != url_.lastPathComponent()) item.name = name_;
  return std::make_shared<ShareActions>(std::move(item), window);
}

bool GtkDocumentInteraction::present(const ShareAnchor& anchor) {
  const auto window = window_.lock();
  if (!window) return false;
  const auto actions = makeActions(window);
  std::vector<ShareRow> rows = actions->rows();
  for (ShareRow& row : rows) {
    row.chosen = [this, act = std::move(row.chosen)] {
      if (sheet_) sheet_->close(act);
    };
  }
  const bool narrow = window->traitCollection().horizontalSizeClass == SizeClass::Compact;
  std::function<void()> closed;
  if (narrow) closed = [this] { sheet_->close(); };
  GtkWidget* content = makeShareSheet(actions->item(), actions->notice(), std::move(rows),
                                      std::max(200, gtk_widget_get_height(GTK_WIDGET(window->overlay())) - HeightLeftFree),
                                      std::move(closed));
  sheet_ = std::make_unique<SharePresentation>(window, content, anchor, [this] {
    sheet_.reset();
    if (const auto delegate = delegate_.lock()) delegate->documentInteractionControllerDidDismissOptionsMenu(*this);
  });
  // A menu begins there by itself.
  if (narrow) focusFirstShareRow(content);
  return true;
}

bool GtkDocumentInteraction::presentOptionsMenuFromRect(const Rect& rect, const ViewRef& view, bool) {
  return present({nullptr, areaOf(rect, view)});
}

bool GtkDocumentInteraction::presentOptionsMenuFromBarButtonItem(const BarButtonItemRef& item, bool) {
  const auto window = window_.lock();
  if (!window || !item) return false;
  return present({findBarItemWidget(GTK_WIDGET(window->widget()), *item), std::nullopt});
}

bool GtkDocumentInteraction::presentOpenInMenu() {
  const auto window = window_.lock();
  return window && makeActions(window)->chooseApplication();
}

bool GtkDocumentInteraction::openInPlaceWith(const ApplicationRecord& application) {
  const auto window = window_.lock();
  return window && makeActions(window)->openWithApplication(application);
}

}  // namespace vaelo
