// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/accounts_page.h"

#include <adwaita.h>

#include <algorithm>
#include <functional>
#include <memory>
#include <vector>

#include "host/drive/account.h"
#include "host/drive/local_accounts.h"
#include "host/gtk/dialog_size.h"
#include "host/gtk/list/worker.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"
#include "platform/platform.h"

namespace vaelo {

namespace {

std::string messageFor(const Error& error) {
  if (error.code == FileErrorCode::WriteInvalidFileName) return _("An account needs a name of letters, at most 100.");
  if (error.code == FileErrorCode::WriteFileExists) return _("There is an account of this name already.");
  if (error.code == FileErrorCode::NoSuchFile) return _("This account is no longer on the device.");
  if (error.code == FileErrorCode::WriteOutOfSpace) return _("There is no space left on the disk.");
  return translated(error.localizedFailureReason.value_or(error.description()));
}

/// Lives as long as its window.
class AccountsPage {
 public:
  AccountsPage(GtkWindow* over, const DriveLayout& layout, NotificationCenter& notifications)
      : accounts_(layout, Platform::current().log), window_(GTK_WINDOW(adw_window_new())) {
    gtk_window_set_transient_for(window_, over);
    gtk_window_set_destroy_with_parent(window_, TRUE);
    gtk_window_set_modal(window_, TRUE);
    gtk_window_set_title(window_, _("Accounts"));
    setDialogSize(window_, over, 480);
    page_ = adw_preferences_page_new();
    known_ = ADW_PREFERENCES_GROUP(adw_preferences_group_new());
    adw_preferences_group_set_title(known_, _("On This Device"));
    adw_preferences_page_add(ADW_PREFERENCES_PAGE(page_), known_);
    adw_preferences_page_add(ADW_PREFERENCES_PAGE(page_), makeAddGroup());
    gtk_widget_set_vexpand(page_, TRUE);
    GtkWidget* box = gtk_box_new(GTK_ORIENTATION_VERTICAL, 0);
    gtk_box_append(GTK_BOX(box), adw_header_bar_new());
    gtk_box_append(GTK_BOX(box), page_);
    adw_window_set_content(ADW_WINDOW(window_), box);
    GtkEventController* keys = gtk_shortcut_controller_new();
    gtk_shortcut_controller_add_shortcut(
        GTK_SHORTCUT_CONTROLLER(keys),
        gtk_shortcut_new(gtk_shortcut_trigger_parse_string("Escape"), gtk_named_action_new("window.close")));
    gtk_widget_add_controller(GTK_WIDGET(window_), keys);
    token_ = notifications.addObserver(AccountDidChangeNotification, [this](const Notification&) { reload(); });
    reload();
  }
  GtkWindow* window() const { return window_; }

 private:
  using Change = std::function<std::optional<Error>(LocalAccounts&)>;

  AdwPreferencesGroup* makeAddGroup() {
    AdwPreferencesGroup* group = ADW_PREFERENCES_GROUP(adw_preferences_group_new());
    adw_preferences_group_set_title(group, _("Another Account"));
    adw_preferences_group_set_description(group, _("Each account has documents of its own on this device."));
    name_ = adw_entry_row_new();
    adw_preferences_row_set_title(ADW_PREFERENCES_ROW(name_), _("Name"));
    adw_entry_row_set_show_apply_button(ADW_ENTRY_ROW(name_), TRUE);
    // A field that has the keyboard raises a phone's: not before it is known that there is nothing else to begin with.
    gtk_widget_set_can_focus(name_, FALSE);
    g_signal_connect_swapped(name_, "apply", G_CALLBACK(+[](AccountsPage* self) {
                               const std::string name = gtk_editable_get_text(GTK_EDITABLE(self->name_));
                               self->change([name](LocalAccounts& accounts) { return accounts.add(name); });
                             }),
                             this);
    adw_preferences_group_add(group, name_);
    problem_ = gtk_label_new(nullptr);
    gtk_label_set_wrap(GTK_LABEL(problem_), TRUE);
    gtk_label_set_xalign(GTK_LABEL(problem_), 0);
    gtk_widget_set_margin_top(problem_, 12);
    gtk_widget_add_css_class(problem_, "error");
    gtk_widget_set_visible(problem_, FALSE);
    adw_preferences_group_add(group, problem_);
    return group;
  }

  void reload() {
    worker_.run(
        [this, accounts = accounts_]() -> std::function<void()> { return [this, known = accounts.all()] { show(known); }; });
  }

  void show(const std::vector<LocalAccounts::Known>& known) {
    GtkWidget* focus = gtk_window_get_focus(window_);
    const auto had = std::find_if(rows_.begin(), rows_.end(),
                                  [&](GtkWidget* row) { return focus && gtk_widget_is_ancestor(focus, row); });
    const auto focused = static_cast<std::size_t>(had - rows_.begin());
    const bool takesFocus = !gtk_widget_get_can_focus(name_) || focused < rows_.size();
    for (GtkWidget* row : rows_) adw_preferences_group_remove(known_, row);
    rows_.clear();
    for (const LocalAccounts::Known& account : known) rows_.push_back(makeRow(account));
    for (GtkWidget* row : rows_) adw_preferences_group_add(known_, row);
    gtk_widget_set_can_focus(name_, TRUE);
    if (!takesFocus) return;
    gtk_widget_grab_focus(rows_.empty() ? name_ : rows_[focused < rows_.size() ? focused : 0]);
  }

  GtkWidget* makeRow(const LocalAccounts::Known& account) {
    const bool isIn = account.isCurrent && account.record.signedIn;
    const std::string name = account.record.name.empty() ? _("Unnamed account") : account.record.name;
    GtkWidget* row = adw_action_row_new();
    adw_preferences_row_set_use_markup(ADW_PREFERENCES_ROW(row), FALSE);
    adw_preferences_row_set_title(ADW_PREFERENCES_ROW(row), name.c_str());
    adw_action_row_set_title_lines(ADW_ACTION_ROW(row), 1);
    adw_action_row_set_subtitle(ADW_ACTION_ROW(row), isIn ? _("Signed in") : _("Signed out"));
    GtkWidget* button = gtk_button_new_with_label(isIn ? _("Sign Out") : _("Sign In"));
    gtk_widget_set_valign(button, GTK_ALIGN_CENTER);
    // TRANSLATORS: what a button's name is read aloud as: what it does, and the account's name.
    const std::string spoken = filled(_("%s: %s"), {gtk_button_get_label(GTK_BUTTON(button)), name});
    gtk_accessible_update_property(GTK_ACCESSIBLE(button), GTK_ACCESSIBLE_PROPERTY_LABEL, spoken.c_str(), -1);
    struct Press {
      AccountsPage* page;
      Change change;
    };
    const Change press =
        isIn ? Change([](LocalAccounts& accounts) { return accounts.signOut(); })
             : Change([token = account.record.token](LocalAccounts& accounts) { return accounts.signIn(token); });
    g_signal_connect_data(
        button, "clicked", G_CALLBACK(+[](GtkButton*, gpointer held) {
          const auto* pressed = static_cast<Press*>(held);
          pressed->page->change(pressed->change);
        }),
        new Press{this, press}, [](gpointer held, GClosure*) { delete static_cast<Press*>(held); }, GConnectFlags(0));
    adw_action_row_add_suffix(ADW_ACTION_ROW(row), button);
    return row;
  }

  void change(const Change& asked) {
    gtk_widget_set_visible(problem_, FALSE);
    // One at a time: the page shows what came of it when the account file has changed.
    gtk_widget_set_sensitive(page_, FALSE);
    worker_.run([this, accounts = accounts_, asked]() mutable -> std::function<void()> {
      return [this, failed = asked(accounts)] { changed(failed); };
    });
  }

  void changed(const std::optional<Error>& failed) {
    gtk_widget_set_sensitive(page_, TRUE);
    if (failed) {
      gtk_label_set_text(GTK_LABEL(problem_), messageFor(*failed).c_str());
      gtk_widget_set_visible(problem_, TRUE);
    } else {
      gtk_editable_set_text(GTK_EDITABLE(name_), "");
    }
    reload();
  }

  LocalAccounts accounts_;
  GtkWindow* window_;
  GtkWidget* page_ = nullptr;
  AdwPreferencesGroup* known_ = nullptr;
  GtkWidget* name_ = nullptr;
  GtkWidget* problem_ = nullptr;
  std::vector<GtkWidget*> rows_;
  NotificationCenter::Token token_;
  Worker worker_;
};

}  // namespace

GtkWindow* showAccountsPage(GtkWindow* over, const DriveLayout& layout, NotificationCenter& notifications) {
  auto* page = new AccountsPage(over, layout, notifications);
  GtkWindow* window = page->window();
  g_signal_connect(window, "destroy", G_CALLBACK(+[](GtkWindow*, AccountsPage* shown) { delete shown; }), page);
  gtk_window_present(window);
  return window;
}

}  // namespace vaelo
