// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/share_save.h"

#include <atomic>
#include <utility>

#include "host/desktop/copy_out.h"
#include "host/gtk/alert_dialog.h"
#include "host/gtk/gtk_window.h"
#include "host/gtk/list/worker.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

constexpr unsigned ProgressAfter = 500;     // milliseconds; what is quicker needs no window
constexpr unsigned ProgressInterval = 100;  // milliseconds

/// One copy, from its start to the word about its end; destroys itself then.
class Saving {
 public:
  Saving(const URL& item, std::string name, GFile* destination, const std::shared_ptr<GtkWindowHost>& window)
      : name_(std::move(name)),
        window_(window),
        cancellable_(g_cancellable_new()),
        fraction_(std::make_shared<std::atomic<double>>(0)) {
    const GRef<GFile> source(g_file_new_for_path(item.path().c_str()));
    const auto copy = std::make_shared<CopyOut>(source.get(), destination, cancellable_.get(),
                                                [fraction = fraction_](std::uint64_t done, std::uint64_t all) {
                                                  if (all) *fraction = static_cast<double>(done) / static_cast<double>(all);
                                                });
    worker_.run([this, copy]() -> std::function<void()> {
      const CopyOutcome outcome = copy->run();
      return [this, outcome] { ended(outcome); };
    });
    timer_ = g_timeout_add(
        ProgressAfter,
        [](gpointer held) -> gboolean {
          static_cast<Saving*>(held)->showProgress();
          return G_SOURCE_REMOVE;
        },
        this);
  }

 private:
  ~Saving() {
    g_source_remove(timer_);
    if (!dialog_) return;
    g_signal_handlers_disconnect_by_data(dialog_, this);
    gtk_window_destroy(GTK_WINDOW(dialog_));
    g_clear_weak_pointer(&dialog_);
  }

  void showProgress() {
    const auto window = window_.lock();
    g_set_weak_pointer(&dialog_,
                       adw_message_dialog_new(window ? window->widget() : nullptr, _("Saving a Copy"), name_.c_str()));
    bar_ = gtk_progress_bar_new();
    gtk_accessible_update_property(GTK_ACCESSIBLE(bar_), GTK_ACCESSIBLE_PROPERTY_LABEL, _("Progress of the copy"), -1);
    adw_message_dialog_set_extra_child(ADW_MESSAGE_DIALOG(dialog_), bar_);
    adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog_), "cancel", _("Cancel"));
    adw_message_dialog_set_close_response(ADW_MESSAGE_DIALOG(dialog_), "cancel");
    g_signal_connect_swapped(dialog_, "response",
                             G_CALLBACK(+[](Saving* self) { g_cancellable_cancel(self->cancellable_.get()); }), this);
    gtk_window_present(GTK_WINDOW(dialog_));
    timer_ = g_timeout_add(
        ProgressInterval,
        [](gpointer held) -> gboolean {
          auto* self = static_cast<Saving*>(held);
          if (self->dialog_) gtk_progress_bar_set_fraction(GTK_PROGRESS_BAR(self->bar_), *self->fraction_);
          return G_SOURCE_CONTINUE;
        },
        this);
  }

  void ended(const CopyOutcome& outcome) {
    const auto window = window_.lock();
    const std::string name = name_;
    delete this;
    if (!window) return;
    switch (outcome.kind) {
      case CopyOutcome::Kind::Cancelled:
        window->showToast(_("No copy was saved."));
        return;
      case CopyOutcome::Kind::Failed:
        return showMessage(window->widget(), _("The Copy Could Not Be Saved"),
                           filled(_("“%s”: %s"), {name, outcome.reason}));
      case CopyOutcome::Kind::Copied:
        break;
    }
    if (outcome.notCopied == 0) {
      window->showToast(filled(_("Saved a copy of “%s”."), {name}));
      return;
    }
    showMessage(window->widget(), _("The Copy Is Not Complete"),
                filled(ngettext("%s item in “%s” is not downloaded and was left out of the copy.",
                                "%s items in “%s” are not downloaded and were left out of the copy.",
                                static_cast<unsigned long>(outcome.notCopied)),
                       {numberText(static_cast<std::int64_t>(outcome.notCopied)), name}));
  }

  std::string name_;
  std::weak_ptr<GtkWindowHost> window_;
  GRef<GCancellable> cancellable_;
  std::shared_ptr<std::atomic<double>> fraction_;  // written by the worker
  Worker worker_;
  unsigned timer_ = 0;
  GtkWidget* dialog_ = nullptr;  // weak pointer
  GtkWidget* bar_ = nullptr;     // the dialog's
};

struct Question {
  URL item;
  std::string name;
  std::weak_ptr<GtkWindowHost> window;
};

void answered(GtkNativeDialog* chooser, int response, gpointer held) {
  const std::unique_ptr<Question> question(static_cast<Question*>(held));
  const auto window = question->window.lock();
  if (response == GTK_RESPONSE_ACCEPT && window) {
    const GRef<GFile> destination(gtk_file_chooser_get_file(GTK_FILE_CHOOSER(chooser)));
    if (destination) new Saving(question->item, question->name, destination.get(), window);
  }
  g_object_unref(chooser);
}

}  // namespace

void saveCopyOf(const URL& item, const std::string& name, const std::shared_ptr<GtkWindowHost>& window) {
  GtkFileChooserNative* chooser = gtk_file_chooser_native_new(_("Save a Copy"), window->widget(),
                                                              GTK_FILE_CHOOSER_ACTION_SAVE, _("_Save"), _("_Cancel"));
  gtk_native_dialog_set_modal(GTK_NATIVE_DIALOG(chooser), TRUE);
  gtk_file_chooser_set_current_name(GTK_FILE_CHOOSER(chooser), name.c_str());
  auto* question = new Question{item, name, window};
  g_signal_connect(chooser, "response", G_CALLBACK(answered), question);
  gtk_native_dialog_show(GTK_NATIVE_DIALOG(chooser));
}

}  // namespace vaelo
