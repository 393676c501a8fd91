// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/change_toasts.h"

#include "host/gtk/gtk_screens.h"
#include "host/gtk/gtk_window.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "items/file_utils.h"

namespace vaelo {

namespace {

constexpr unsigned UndoSeconds = 8;

std::string shown(const std::string& name) { return takeString(g_filename_display_name(name.c_str())); }
/// As lists show it, which may be without its extension.
std::string nameOf(const URL& url) {
  const Value name = FileUtils::getResourceValueForURL(ResourceKey::LocalizedName, url);
  const std::string* text = name.get<std::string>();
  return text ? *text : shown(url.lastPathComponent());
}

std::string number(std::size_t value) { return numberText(static_cast<std::int64_t>(value)); }

void forget(AdwToast*& toast) {
  if (!toast) return;
  AdwToast* gone = toast;
  g_clear_weak_pointer(&toast);
  adw_toast_dismiss(gone);
}

}  // namespace

ChangeToasts::ChangeToasts(GtkScreens& screens, LocalCloudDocuments& drive, MoveHistory& moves)
    : screens_(screens), drive_(drive), moves_(moves) {
  moves_.setOffer([this](const std::shared_ptr<const MoveHistory::Batch>& batch) { offerUndo(batch); });
  drive_.removals().setObserver([this](const TreeRemovals::News& news) { removalWent(news); });
}

ChangeToasts::~ChangeToasts() {
  moves_.setOffer(nullptr);
  drive_.removals().setObserver(nullptr);
  g_clear_weak_pointer(&undo_);
  g_clear_weak_pointer(&removal_);
  g_clear_weak_pointer(&told_);
}

std::string ChangeToasts::folderName(const URL& folder) const {
  if (drive_.isDocumentsContainer(folder)) {
    const Result<CloudContainerRef> container = drive_.containerForURL(folder);
    if (container.value) return (*container.value)->localizedName();
  }
  return nameOf(folder);
}

std::string ChangeToasts::textFor(const MoveHistory::Batch& batch) const {
  if (batch.size() > 1) return filled(ngettext("Moved %s item", "Moved %s items", batch.size()), {number(batch.size())});
  const URL& from = batch.front().from;
  const URL& to = batch.front().to;
  const URL folder = to.deletingLastPathComponent();
  if (from.deletingLastPathComponent() == folder) return filled(_("Renamed to “%s”"), {nameOf(to)});
  return filled(_("Moved “%s” to “%s”"), {nameOf(to), folderName(folder)});
}

void ChangeToasts::offerUndo(const std::shared_ptr<const MoveHistory::Batch>& batch) {
  const auto window = screens_.window();
  if (!window) return;
  for (const MoveHistory::Move& move : *batch) window->itemMoved(move.from, move.to);
  forget(undo_);
  AdwToast* toast = window->showToast(
      textFor(*batch), _("Undo"), [this, batch] { undo(*batch); }, UndoSeconds);
  g_set_weak_pointer(&undo_, toast);
}

void ChangeToasts::undo(const MoveHistory::Batch& batch) {
  const std::vector<Error> errors = moves_.undo(batch);
  if (const auto window = screens_.window()) {
    for (const MoveHistory::Move& move : batch) window->itemMoved(move.to, move.from);
    // The button that was pressed goes with its message.
    window->returnFocus(nullptr);
  }
  if (errors.size() == 1) {
    const Error& error = errors.front();
    say(error.localizedDescription ? *error.localizedDescription : error.description());
  } else if (!errors.empty()) {
    say(filled(ngettext("%s item can’t be put back.", "%s items can’t be put back.", errors.size()),
               {number(errors.size())}));
  }
}

void ChangeToasts::removalWent(const TreeRemovals::News& news) {
  using Stage = TreeRemovals::Stage;
  const auto window = screens_.window();
  if (!window) return;
  const std::string name = shown(news.name);
  switch (news.stage) {
    case Stage::Waiting: {
      forget(removal_);
      // Messages wait for each other: it would come again after this one, when it is true no more.
      forget(told_);
      const std::string text =
          filled(ngettext("Deleting “%s” and its %s item…", "Deleting “%s” and its %s items…", news.total - 1),
                 {name, number(news.total - 1)});
      AdwToast* toast = window->showToast(
          text, _("Cancel"), [this] { drive_.removals().cancel(); }, 0);
      g_set_weak_pointer(&removal_, toast);
      return;
    }
    case Stage::Removing:
      if (!removal_) return;  // the user has closed it
      gtk_label_set_text(GTK_LABEL(adw_toast_get_custom_title(removal_)),
                         filled(ngettext("Deleting “%s”: %s of %s item…", "Deleting “%s”: %s of %s items…", news.total),
                                {name, number(news.removed), number(news.total)})
                             .c_str());
      return;
    case Stage::Removed:
      forget(removal_);
      return;
    case Stage::PutBack:
      forget(removal_);
      say(news.removed == 0 ? filled(_("“%s” is back, with everything in it."), {nameOf(URL(news.place))})
                            : filled(ngettext("“%s” is back. %s of its items was deleted already.",
                                              "“%s” is back. %s of its items were deleted already.", news.removed),
                                     {nameOf(URL(news.place)), number(news.removed)}));
      return;
    case Stage::Failed:
      forget(removal_);
      say(filled(_("“%s” can’t be deleted entirely. What is left of it is back."), {name}));
      return;
  }
}

void ChangeToasts::say(const std::string& text) {
  const auto window = screens_.window();
  if (!window) return;
  forget(told_);
  g_set_weak_pointer(&told_, window->showToast(text));
}

}  // namespace vaelo
