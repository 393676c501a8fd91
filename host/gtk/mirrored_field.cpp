// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/mirrored_field.h"

#include <unicode/ubidi.h>
#include <unicode/unistr.h>

#include <utility>

#include "host/gtk/mirrored_text.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

/// What the toolkit keeps free at the end of the field for the clear button, whether that shows or not.
int roomOfClearButton(GtkWidget* entry) {
  int width = 0;
  // Its button is the last child, or the first one where people read from the right.
  for (GtkWidget* child = gtk_widget_get_first_child(entry); child; child = gtk_widget_get_next_sibling(child)) {
    if (GTK_IS_IMAGE(child)) gtk_widget_measure(child, GTK_ORIENTATION_HORIZONTAL, -1, nullptr, &width, nullptr, nullptr);
  }
  return width;
}

/// The toolkit counts from where the text itself begins; the model means sides, or where the interface begins.
float xalignOf(const TextField& field, GtkWidget* entry) {
  if (field.textAlignment() == TextAlignment::Center) return 0.5F;
  const icu::UnicodeString text = icu::UnicodeString::fromUTF8(field.text());
  const UBiDiDirection own = ubidi_getBaseDirection(text.getBuffer(), text.length());
  const bool interfaceTurned = gtk_widget_get_direction(entry) == GTK_TEXT_DIR_RTL;
  const bool textTurned = own == UBIDI_NEUTRAL ? interfaceTurned : own == UBIDI_RTL;
  const bool right =
      field.textAlignment() == TextAlignment::Natural ? interfaceTurned : field.textAlignment() == TextAlignment::Right;
  return right == textTurned ? 0 : 1;
}

}  // namespace

MirroredField::MirroredField(TextField& field)
    : field_(std::static_pointer_cast<TextField>(field.shared_from_this())),
      entry_(GTK_WIDGET(g_object_ref_sink(gtk_entry_new()))),
      focus_(gtk_event_controller_focus_new()),
      press_(gtk_gesture_click_new()) {
  gtk_widget_add_controller(entry_, focus_);
  gtk_event_controller_set_propagation_phase(GTK_EVENT_CONTROLLER(press_), GTK_PHASE_CAPTURE);
  gtk_widget_add_controller(entry_, GTK_EVENT_CONTROLLER(press_));
  for (const auto& [signal, pressed] : {std::pair("pressed", true), std::pair("released", false)}) {
    const auto note =
        pressed ? +[](MirroredField* self) { self->pressed_ = true; } : +[](MirroredField* self) { self->pressed_ = false; };
    g_signal_connect_swapped(press_, signal, G_CALLBACK(note), this);
  }
  g_signal_connect_swapped(entry_, "changed", G_CALLBACK(+[](MirroredField* self) { self->typed(); }), this);
  g_signal_connect_swapped(entry_, "activate", G_CALLBACK(+[](MirroredField* self) {
                             const std::shared_ptr<TextField> kept = self->field_;
                             kept->pressReturn();
                           }),
                           this);
  g_signal_connect_swapped(entry_, "icon-release",
                           G_CALLBACK(+[](MirroredField* self) { gtk_editable_set_text(GTK_EDITABLE(self->entry_), ""); }),
                           this);
  for (const char* property : {"notify::cursor-position", "notify::selection-bound"}) {
    g_signal_connect_swapped(entry_, property, G_CALLBACK(+[](MirroredField* self) { self->selectionMoved(); }), this);
  }
  g_signal_connect_swapped(focus_, "enter", G_CALLBACK(+[](MirroredField* self) { self->focusCame(); }), this);
  g_signal_connect_swapped(focus_, "leave", G_CALLBACK(+[](MirroredField* self) { self->focusLeft(); }), this);
  update();
}

MirroredField::~MirroredField() {
  g_clear_handle_id(&idle_, g_source_remove);
  g_clear_handle_id(&refusal_, g_source_remove);
  g_signal_handlers_disconnect_by_data(entry_, this);
  g_signal_handlers_disconnect_by_data(focus_, this);
  g_signal_handlers_disconnect_by_data(press_, this);
  g_object_unref(entry_);
}

void MirroredField::update() {
  if (taking_) return;
  taking_ = true;
  GtkEntry* entry = GTK_ENTRY(entry_);
  if (field_->text() != gtk_editable_get_text(GTK_EDITABLE(entry_))) {
    gtk_editable_set_text(GTK_EDITABLE(entry_), field_->text().c_str());
  }
  gtk_entry_set_placeholder_text(entry, field_->placeholder().empty() ? nullptr : field_->placeholder().c_str());
  gtk_editable_set_alignment(GTK_EDITABLE(entry_), xalignOf(*field_, entry_));
  PangoAttrList* attributes = attributesOf(field_->font());
  gtk_entry_set_attributes(entry, attributes);
  pango_attr_list_unref(attributes);
  gtk_widget_set_sensitive(entry_, field_->enabled());
  const bool clears = field_->clearButtonMode() == ClearButtonMode::Always ||
                      (field_->clearButtonMode() == ClearButtonMode::WhileEditing && field_->isEditing());
  gtk_entry_set_icon_from_icon_name(entry, GTK_ENTRY_ICON_SECONDARY,
                                    clears && !field_->text().empty() ? "edit-clear-symbolic" : nullptr);
  gtk_entry_set_icon_tooltip_text(entry, GTK_ENTRY_ICON_SECONDARY, _("Clear"));
  // As much at the beginning keeps the middle of the text in the middle of the field.
  gtk_widget_set_margin_start(GTK_WIDGET(gtk_editable_get_delegate(GTK_EDITABLE(entry_))),
                              field_->textAlignment() == TextAlignment::Center ? roomOfClearButton(entry_) : 0);
  // A name at rest looks like a title, and like a field while it is edited.
  gtk_entry_set_has_frame(entry, field_->isEditing());
  gtk_entry_set_input_hints(
      entry,
      static_cast<GtkInputHints>(
          (field_->autocapitalizationType() == AutocapitalizationType::Words ? GTK_INPUT_HINT_UPPERCASE_WORDS
                                                                             : GTK_INPUT_HINT_NONE) |
          (field_->autocorrectionType() == AutocorrectionType::No ? GTK_INPUT_HINT_NO_SPELLCHECK : GTK_INPUT_HINT_NONE)));
  if (!field_->accessibilityLabel().empty()) {
    gtk_accessible_update_property(GTK_ACCESSIBLE(entry_), GTK_ACCESSIBLE_PROPERTY_LABEL,
                                   field_->accessibilityLabel().c_str(), -1);
  }
  keepSelection();
  beginWithCaret();
  GtkRoot* root = gtk_widget_get_root(entry_);
  GtkWidget* focus = root ? gtk_root_get_focus(root) : nullptr;
  const bool focused = focus && (focus == entry_ || gtk_widget_is_ancestor(focus, entry_));
  if (field_->isEditing() && !focused) gtk_entry_grab_focus_without_selecting(entry);
  if (!field_->isEditing() && focused) gtk_root_set_focus(root, nullptr);
  taking_ = false;
}

// The selection of the model, where it is one that code chose: what the user selects comes from the widget, in steps.
void MirroredField::keepSelection() {
  const TextRange& range = field_->selectedRange();
  if (!field_->isEditing() || range == known_) return;
  known_ = range;
  if (idle_ != 0) first_ = range;
  const int from = static_cast<int>(range.location);
  gtk_editable_select_region(GTK_EDITABLE(entry_), from, from + static_cast<int>(range.length));
}

// The toolkit selects all when the focus comes: what the model chose for the beginning is put back after that.
void MirroredField::beginWithCaret() {
  if (field_->isEditing() == edited_) return;
  edited_ = field_->isEditing();
  if (!edited_ || idle_ != 0) return;
  first_ = field_->selectedRange();
  idle_ = g_idle_add_full(
      G_PRIORITY_DEFAULT_IDLE,
      [](gpointer self) -> gboolean {
        auto* mirror = static_cast<MirroredField*>(self);
        mirror->idle_ = 0;
        mirror->field_->setSelectedRange(mirror->first_);
        mirror->known_ = {mirror->field_->text().size() + 1, 0};
        mirror->keepSelection();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
}

void MirroredField::selectionMoved() {
  if (taking_ || !field_->isEditing()) return;
  int start = 0;
  int end = 0;
  gtk_editable_get_selection_bounds(GTK_EDITABLE(entry_), &start, &end);
  if (start == end) start = end = gtk_editable_get_position(GTK_EDITABLE(entry_));
  known_ = {static_cast<std::size_t>(start), static_cast<std::size_t>(end - start)};
  // The caret moves before the text that it moves through: the model must not put the old text back.
  taking_ = true;
  field_->setSelectedRange(known_);
  taking_ = false;
}

void MirroredField::typed() {
  if (taking_) return;
  const std::shared_ptr<TextField> kept = field_;
  // Meanwhile the widget keeps what was typed, and its own caret behind it.
  taking_ = true;
  if (kept->isEditing() || kept->becomeFirstResponder()) kept->userSetText(gtk_editable_get_text(GTK_EDITABLE(entry_)));
  known_ = kept->selectedRange();
  taking_ = false;
  update();
}

void MirroredField::focusCame() {
  if (taking_ || field_->isEditing()) return;
  const std::shared_ptr<TextField> kept = field_;
  if (kept->becomeFirstResponder()) return;
  // What can't be changed doesn't keep the keyboard after a press; the toolkit is still on the way to give it. Who walks by
  // keyboard must be able to walk on from here.
  if (!pressed_ || refusal_ != 0) return;
  refusal_ = g_idle_add_full(
      G_PRIORITY_DEFAULT_IDLE,
      [](gpointer self) -> gboolean {
        auto* mirror = static_cast<MirroredField*>(self);
        mirror->refusal_ = 0;
        mirror->giveFocusBack();
        return G_SOURCE_REMOVE;
      },
      this, nullptr);
}

void MirroredField::giveFocusBack() {
  pressed_ = false;
  GtkRoot* root = gtk_widget_get_root(entry_);
  GtkWidget* focus = root ? gtk_root_get_focus(root) : nullptr;
  if (!field_->isEditing() && focus && gtk_widget_is_ancestor(focus, entry_)) gtk_root_set_focus(root, nullptr);
}

void MirroredField::focusLeft() {
  // A dialog over the window takes the focus away without ending the editing.
  GtkRoot* root = gtk_widget_get_root(entry_);
  if (taking_ || !field_->isEditing() || !root || !GTK_IS_WINDOW(root) || !gtk_window_is_active(GTK_WINDOW(root))) return;
  const std::shared_ptr<TextField> kept = field_;
  if (!kept->resignFirstResponder()) gtk_entry_grab_focus_without_selecting(GTK_ENTRY(entry_));
}

}  // namespace vaelo
