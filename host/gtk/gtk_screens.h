// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <gtk/gtk.h>

#include "host/drive/local_cloud_documents.h"
#include "host/gtk/pango_graphics.h"
#include "platform/ui/screen_factory.h"

namespace vaelo {

class DriveSyncedStore;
class GtkWindowHost;

/// Makes the screens of the GTK platform. Main thread.
class GtkScreens : public ScreenFactory, private Device {
 public:
  /// Both outlive it.
  GtkScreens(LocalCloudDocuments& drive, DriveSyncedStore& tags) : drive_(drive), tags_(tags) {}
  /// The application that new windows belong to.
  void setApplication(GtkApplication* application) { application_ = application; }
  /// The last window made; null before.
  std::shared_ptr<GtkWindowHost> window() const { return window_.lock(); }

  Graphics& graphics() override { return graphics_; }
  Device& device() override { return *this; }
  WindowRef makeWindow(const Rect& bounds) override;
  DocumentListControllerRef makeRootList() override;
  DocumentListControllerRef makeList(const URL& folder) override;
  std::optional<std::vector<DocumentListControllerRef>> hierarchyTo(const URL& folder) override;
  ViewControllerRef makeDriveUnavailable() override;
  bool canPreviewItem(const URL& url) override;
  std::shared_ptr<DocumentInteractionController> makeDocumentInteraction(const URL& url) override;
  std::shared_ptr<UpgradeButton> makeUpgradeButton(StorageOfferRef offer) override;
  std::shared_ptr<UpgradeFlowManager> makeUpgradeFlow(StorageOfferRef offer) override;
  void runPreOpenAlert(const URL& url, const ViewControllerRef& presenter, std::function<void()> open) override;

 private:
  InterfaceIdiom userInterfaceIdiom() override;
  Screen mainScreen() override;
  Rect statusBarFrame() override { return {}; }
  InterfaceOrientation statusBarOrientation() override;

  std::function<void(const std::string&)> pageOpener();

  LocalCloudDocuments& drive_;
  DriveSyncedStore& tags_;
  PangoGraphics graphics_;
  GtkApplication* application_ = nullptr;
  std::weak_ptr<GtkWindowHost> window_;
};

}  // namespace vaelo
