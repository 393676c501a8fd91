// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/folder_picker.h"

#include "fileops/ui_utils.h"
#include "host/support/display_name.h"
#include "host/support/texts.h"
#include "items/file_utils.h"
#include "platform/localized.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

constexpr int TouchSize = 44;

void describe(GtkWidget* widget, const char* label) {
  gtk_widget_set_tooltip_text(widget, label);
  gtk_accessible_update_property(GTK_ACCESSIBLE(widget), GTK_ACCESSIBLE_PROPERTY_LABEL, label, -1);
}

}  // namespace

FolderPicker::FolderPicker(std::shared_ptr<DocumentTargetSelectionController> picker, CloudDocuments& drive, GtkWindow* over)
    : picker_(std::move(picker)), drive_(drive) {
  build(over);
  FolderViewEvents events;
  // Until a folder shows, the rows are those of the one before: a second tap would walk to a folder beside it.
  events.activated = [this](const std::string& path) {
    if (shown_) goTo(URL(path, true));
  };
  view_.setEvents(std::move(events));
  view_.setEmptyText("folder-symbolic", _("No folders here"), "");
  // Within one library the way begins at its top; across libraries at the drive's root, which lists them.
  std::optional<URL> top = drive_.defaultContainerURL();
  if (!picker_->allowsCrossContainer() && !picker_->itemsToMove().empty()) {
    const Result<CloudContainerRef> container = drive_.containerForURL(picker_->itemsToMove().front());
    if (container.value && *container.value) top = (*container.value)->documentsFolderURL();
  }
  if (top) goTo(*top);
  gtk_window_present(GTK_WINDOW(window_));
}

FolderPicker::~FolderPicker() {
  g_signal_handlers_disconnect_by_data(window_, this);
  g_signal_handlers_disconnect_by_data(back_, this);
  g_signal_handlers_disconnect_by_data(move_, this);
  g_signal_handlers_disconnect_by_data(newFolder_, this);
  if (prompt_ && prompt_->alert()->presentingViewController()) prompt_->alert()->dismissViewControllerAnimated(false);
  gtk_window_destroy(GTK_WINDOW(window_));
}

void FolderPicker::build(GtkWindow* over) {
  window_ = adw_window_new();
  gtk_window_set_transient_for(GTK_WINDOW(window_), over);
  gtk_window_set_modal(GTK_WINDOW(window_), TRUE);
  gtk_window_set_title(GTK_WINDOW(window_), _("Move"));
  const int width = gtk_widget_get_width(GTK_WIDGET(over));
  const int height = gtk_widget_get_height(GTK_WIDGET(over));
  // On a phone it takes the whole screen.
  constexpr int narrowBelow = 480;
  gtk_window_set_default_size(GTK_WINDOW(window_), std::min(width, 440),
                              width < narrowBelow ? height : std::min(height, 600));
  GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
  GtkWidget* header = adw_header_bar_new();
  adw_header_bar_set_show_end_title_buttons(ADW_HEADER_BAR(header), FALSE);
  adw_header_bar_set_show_start_title_buttons(ADW_HEADER_BAR(header), FALSE);
  GtkWidget* cancel = gtk_button_new_with_label(_("Cancel"));
  gtk_actionable_set_action_name(GTK_ACTIONABLE(cancel), "window.close");
  adw_header_bar_pack_start(ADW_HEADER_BAR(header), cancel);
  back_ = gtk_button_new_from_icon_name("go-previous-symbolic");
  describe(back_, _("Back"));
  g_signal_connect_swapped(back_, "clicked", G_CALLBACK(+[](FolderPicker* self) { self->goUp(); }), this);
  adw_header_bar_pack_start(ADW_HEADER_BAR(header), back_);
  title_ = adw_window_title_new(nullptr, nullptr);
  adw_header_bar_set_title_widget(ADW_HEADER_BAR(header), title_);
  move_ = gtk_button_new_with_label(_("Move"));
  gtk_widget_add_css_class(move_, "suggested-action");
  g_signal_connect_swapped(move_, "clicked", G_CALLBACK(+[](FolderPicker* self) { self->choose(); }), this);
  newFolder_ = gtk_button_new_from_icon_name("folder-new-symbolic");
  describe(newFolder_, _("New Folder"));
  g_signal_connect_swapped(newFolder_, "clicked", G_CALLBACK(+[](FolderPicker* self) { self->askForNewFolder(); }), this);
  adw_header_bar_pack_end(ADW_HEADER_BAR(header), newFolder_);
  gtk_box_append(GTK_BOX(box), header);
  GtkWidget* question = gtk_label_new(invitation().c_str());
  gtk_label_set_wrap(GTK_LABEL(question), TRUE);
  gtk_label_set_wrap_mode(GTK_LABEL(question), PANGO_WRAP_WORD_CHAR);
  gtk_label_set_lines(GTK_LABEL(question), 2);
  gtk_label_set_ellipsize(GTK_LABEL(question), PANGO_ELLIPSIZE_MIDDLE);
  gtk_label_set_justify(GTK_LABEL(question), GTK_JUSTIFY_CENTER);
  gtk_widget_add_css_class(question, "dim-label");
  for (void (*margin)(GtkWidget*, int) :
       {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
    margin(question, 6);
  }
  gtk_box_append(GTK_BOX(box), question);
  gtk_widget_set_vexpand(view_.widget(), TRUE);
  gtk_box_append(GTK_BOX(box), view_.widget());
  refusal_ = gtk_label_new(nullptr);
  gtk_label_set_wrap(GTK_LABEL(refusal_), TRUE);
  gtk_label_set_justify(GTK_LABEL(refusal_), GTK_JUSTIFY_CENTER);
  gtk_widget_add_css_class(refusal_, "dim-label");
  // Below the folders, where a thumb is: beside the other buttons a long language or large letters leave no room for it.
  GtkWidget* bottom = gtk_box_new(GTK_ORIENTATION_VERTICAL, 12);
  for (void (*margin)(GtkWidget*, int) :
       {gtk_widget_set_margin_top, gtk_widget_set_margin_bottom, gtk_widget_set_margin_start, gtk_widget_set_margin_end}) {
    margin(bottom, 12);
  }
  gtk_widget_set_size_request(move_, -1, TouchSize);
  gtk_box_append(GTK_BOX(bottom), refusal_);
  gtk_box_append(GTK_BOX(bottom), move_);
  gtk_box_append(GTK_BOX(box), bottom);
  adw_window_set_content(ADW_WINDOW(window_), box);
  g_signal_connect_swapped(window_, "close-request", G_CALLBACK(+[](FolderPicker* self) -> gboolean {
                             const auto kept = self->picker_;
                             kept->userCancelled();
                             return TRUE;
                           }),
                           this);
  GtkEventController* keys = gtk_event_controller_key_new();
  g_signal_connect(keys, "key-pressed",
                   G_CALLBACK(+[](GtkEventControllerKey*, guint key, guint, GdkModifierType, FolderPicker* self) {
                     if (key != GDK_KEY_Escape) return static_cast<gboolean>(FALSE);
                     gtk_window_close(GTK_WINDOW(self->window_));
                     return static_cast<gboolean>(TRUE);
                   }),
                   this);
  gtk_widget_add_controller(window_, keys);
}

std::string FolderPicker::invitation() const {
  const std::vector<URL>& items = picker_->itemsToMove();
  if (items.size() != 1) {
    return filled(ngettext("Move %s item to…", "Move %s items to…", items.size()),
                  {numberText(static_cast<std::int64_t>(items.size()))});
  }
  return filled(_("Move “%s” to…"), {nameOfItem()});
}

std::string FolderPicker::nameOfItem() const { return displayNameOf(picker_->itemsToMove().front()); }

std::string FolderPicker::titleOf(const URL& folder) const {
  if (drive_.isDocumentsContainer(folder)) {
    const Result<CloudContainerRef> container = drive_.containerForURL(folder);
    if (container.value && *container.value) return (*container.value)->localizedName();
  }
  return displayNameOf(folder);
}

void FolderPicker::goTo(const URL& folder) {
  way_.push_back(folder);
  shown_ = false;
  gtk_widget_set_sensitive(move_, FALSE);
  gtk_widget_set_sensitive(newFolder_, FALSE);
  const bool libraries = picker_->allowsCrossContainer() && way_.size() == 1;
  worker_.run([this, folder, libraries, items = picker_->itemsToMove(), &drive = drive_]() -> std::function<void()> {
    MoveTarget target = moveTargetAt(folder, items, libraries, drive);
    return [this, folder, target = std::move(target)] {
      if (way_.back() == folder) show(folder, target);
    };
  });
}

void FolderPicker::goUp() {
  if (way_.size() < 2) return;
  way_.pop_back();
  const URL above = way_.back();
  way_.pop_back();
  goTo(above);
}

void FolderPicker::show(const URL& folder, MoveTarget target) {
  adw_window_title_set_title(ADW_WINDOW_TITLE(title_), titleOf(folder).c_str());
  gtk_widget_set_visible(back_, way_.size() > 1);
  shown_ = true;
  gtk_widget_set_sensitive(move_, target.refusal.empty());
  gtk_widget_set_sensitive(newFolder_, target.takesFolders);
  refuse(target.refusal);
  view_.setEntries(std::move(target.folders));
  view_.grabFocus();
}

void FolderPicker::refuse(const std::string& reason) {
  gtk_label_set_text(GTK_LABEL(refusal_), reason.c_str());
  gtk_widget_set_visible(refusal_, !reason.empty());
}

void FolderPicker::choose() {
  gtk_widget_set_sensitive(move_, FALSE);
  // What is moved from its preview has nobody to move it once it is gone, and the preview with it.
  if (!picker_->delegate()) return refuse(filled(_("“%s” is no longer there."), {nameOfItem()}));
  // Not inside of the press: a long move runs the main loop, which takes this picker away.
  Platform::current().queues.main().async([kept = picker_, folder = way_.back()] {
    if (kept->presentingViewController()) kept->userSelected(folder);
  });
}

void FolderPicker::askForNewFolder() {
  prompt_ = NewFolderPrompt::newWithTitleDoneButtonTextCompletion(
      localized("New Folder"), localized("Create"), [weak = weak_from_this()](const std::string& name, bool& accepted) {
        const auto self = weak.lock();
        return self ? self->makeFolder(name, accepted) : std::string();
      });
  picker_->presentViewController(prompt_->alert(), true);
}

/// Answers what is wrong with the name, or with the folder that is to have it.
std::string FolderPicker::makeFolder(const std::string& name, bool& accepted) {
  const URL made = way_.back().appendingPathComponent(name, true);
  const std::optional<Error> error =
      FileUtils::exists(made) ? Error{FileErrorDomain, FileErrorCode::WriteFileExists, {}, {}, {}} : FileUtils::mkdir(made);
  accepted = !error;
  if (error) return UIUtils::bestMessage(error);
  goTo(made);
  return "";
}

}  // namespace vaelo
