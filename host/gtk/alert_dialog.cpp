// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/alert_dialog.h"

#include <adwaita.h>

#include "host/gtk/prompt_dialog.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

void responded(AdwMessageDialog*, const char* response, gpointer held) {
  const auto& alert = *static_cast<std::shared_ptr<AlertController>*>(held);
  const std::string id = response;
  if (id == "close") {
    // Closing an alert that has one button means that button.
    if (!alert->cancel() && alert->actions().size() == 1) alert->performAction(alert->actions().front());
    return;
  }
  alert->performAction(alert->actions().at(static_cast<std::size_t>(std::stoul(id))));
}

}  // namespace

GtkWindow* showAlertDialog(const std::shared_ptr<AlertController>& alert, GtkWindow* over, std::function<void()> shown) {
  if (!alert->textFields().empty()) return showPromptDialog(alert, over, std::move(shown));
  const bool titled = !alert->title().empty();
  GtkWidget* dialog = adw_message_dialog_new(over, titled ? alert->title().c_str() : nullptr,
                                             alert->message().empty() ? nullptr : alert->message().c_str());
  for (std::size_t i = 0; i < alert->actions().size(); ++i) {
    const AlertActionRef& action = alert->actions()[i];
    const std::string id = std::to_string(i);
    adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog), id.c_str(), action->title().c_str());
    adw_message_dialog_set_response_enabled(ADW_MESSAGE_DIALOG(dialog), id.c_str(), action->enabled());
    if (action->style() == AlertActionStyle::Destructive) {
      adw_message_dialog_set_response_appearance(ADW_MESSAGE_DIALOG(dialog), id.c_str(), ADW_RESPONSE_DESTRUCTIVE);
    }
  }
  if (alert->actions().size() == 1) adw_message_dialog_set_default_response(ADW_MESSAGE_DIALOG(dialog), "0");
  g_signal_connect_data(
      dialog, "response", G_CALLBACK(responded), new std::shared_ptr<AlertController>(alert),
      [](gpointer held, GClosure*) { delete static_cast<std::shared_ptr<AlertController>*>(held); }, GConnectFlags(0));
  gtk_window_present(GTK_WINDOW(dialog));
  if (shown) shown();
  return GTK_WINDOW(dialog);
}

void showMessage(GtkWindow* over, const std::string& title, const std::string& text) {
  GtkWidget* dialog = adw_message_dialog_new(over, title.c_str(), text.c_str());
  adw_message_dialog_add_response(ADW_MESSAGE_DIALOG(dialog), "close", _("OK"));
  gtk_window_present(GTK_WINDOW(dialog));
}

}  // namespace vaelo
