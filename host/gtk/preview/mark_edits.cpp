// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/preview/mark_edits.h"

#include <algorithm>
#include <utility>

namespace vaelo {

void MarkEdits::add(PageMark mark) {
  mark.number = ++lastNumber_;
  edits_.push_back({Edit::Kind::Add, std::move(mark)});
  apply(edits_.back());
}

void MarkEdits::remove(const PageMark& mark) {
  edits_.push_back({Edit::Kind::Remove, mark});
  apply(edits_.back());
}

void MarkEdits::rewrite(const PageMark& mark, std::string text) {
  edits_.push_back({Edit::Kind::Rewrite, mark});
  edits_.back().mark.text = std::move(text);
  apply(edits_.back());
}

bool MarkEdits::undo() {
  if (edits_.empty()) return false;
  edits_.pop_back();
  marks_.clear();
  changed_.clear();
  for (const Edit& edit : edits_) apply(edit);
  return true;
}

void MarkEdits::apply(const Edit& edit) {
  if (edit.kind == Edit::Kind::Add) return marks_.push_back(edit.mark);
  const bool isRemoval = edit.kind == Edit::Kind::Remove;
  if (edit.mark.stored >= 0) {
    auto found = std::find_if(changed_.begin(), changed_.end(),
                              [&](const Changed& changed) { return changed.mark.isSame(edit.mark); });
    if (found == changed_.end()) found = changed_.insert(found, {edit.mark, false});
    if (isRemoval) found->removed = true;
    found->mark.text = edit.mark.text;
    return;
  }
  const auto found =
      std::find_if(marks_.begin(), marks_.end(), [&](const PageMark& mark) { return mark.isSame(edit.mark); });
  if (found == marks_.end()) return;
  if (isRemoval) {
    marks_.erase(found);
  } else {
    found->text = edit.mark.text;
  }
}

std::map<int, std::vector<int>> MarkEdits::removed() const {
  std::map<int, std::vector<int>> removed;
  for (const Changed& changed : changed_) {
    if (changed.removed) removed[changed.mark.page].push_back(changed.mark.stored);
  }
  return removed;
}

std::vector<std::string> MarkEdits::requests() const {
  std::vector<std::string> requests;
  for (const PageMark& mark : marks_) requests.push_back(wordsOf(mark));
  for (const auto& [mark, removed] : changed_) {
    const std::string place = std::to_string(mark.page) + " " + std::to_string(mark.stored);
    requests.push_back(removed ? "remove " + place : "rewrite " + place + " " + mark.text);
  }
  return requests;
}

}  // namespace vaelo
