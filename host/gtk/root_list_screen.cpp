// SPDX-License-Identifier: GPL-3.0-or-later
#include "host/gtk/root_list_screen.h"

#include <utility>

#include "host/gtk/list/folder_reader.h"
#include "host/support/glib_ptr.h"
#include "host/support/texts.h"

namespace vaelo {

namespace {

/// As people write it.
std::string withoutHome(const std::string& path) {
  const std::string home = g_get_home_dir();
  const std::string shown = path.starts_with(home + "/") ? "~" + path.substr(home.size()) : path;
  return takeString(g_filename_display_name(shown.c_str()));
}

}  // namespace

void RootListScreen::fill() {
  folderView().setEmptyText("folder-symbolic", _("This folder is empty"),
                            // TRANSLATORS: "Select" is the button that begins selecting; %s is a folder's path.
                            filled(_("Press “Select” to make a folder. Files that you put into “%s” appear here."),
                                   {withoutHome(presentedURL()->path())}));
  follow();
  read();
}

void RootListScreen::follow() {
  const std::string folder = presentedURL()->path();
  ownFolder_.start(
      folder, [this](const FolderChanges&) { read(); }, [this] { folderWasRemoved(); });
  mirror_.start(
      URL(folder).deletingLastPathComponent().path(), [this](const FolderChanges&) { read(); }, [] {});
}

void RootListScreen::read() {
  const std::string folder = presentedURL()->path();
  worker_.run([this, folder]() -> std::function<void()> {
    FolderReading reading = readFolder(folder);
    return [this, folder, reading = std::move(reading)] {
      if (!reading.snapshot) {
        unreadable_ = true;
        return folderView().setUnreadable(reading.errorNumber);
      }
      // What couldn't be read couldn't be followed either.
      if (std::exchange(unreadable_, false)) return fill();
      std::vector<FolderEntry> entries;
      const std::size_t count = reading.snapshot->size();
      std::size_t i = 0;
      const auto add = [&] {
        const std::string name(reading.snapshot->name(i));
        entries.push_back(
            {takeString(g_filename_display_name(name.c_str())), folder + "/" + name, reading.snapshot->kind(i), ""});
      };
      // Libraries stand behind the folders and before the documents.
      for (; i < count && isListedAsFolder(reading.snapshot->kind(i)); ++i) add();
      const std::vector<FolderEntry> own = libraries();
      entries.insert(entries.end(), own.begin(), own.end());
      for (; i < count; ++i) add();
      folderView().setEntries(std::move(entries));
      reportItems();
    };
  });
}

std::vector<FolderEntry> RootListScreen::libraries() const {
  std::vector<FolderEntry> entries;
  for (const CloudContainerRef& container : drive().allContainers()) {
    const std::optional<URL> documents = container->documentsFolderURL();
    if (!documents || container->identifier() == drive().defaultContainerIdentifier()) continue;
    entries.push_back({container->localizedName(), documents->path(), EntryKind::Folder, LibraryIcon});
  }
  return entries;
}

URLList RootListScreen::shownItems() {
  const std::shared_ptr<const FolderEntries> entries = folderView().model().entries();
  if (!entries) return {};
  const auto indexOf = [entries](const URL& url, std::size_t guess) -> std::optional<std::size_t> {
    if (guess < entries->size() && (*entries)[guess].path == url.path()) return guess;
    return entries->indexOf(url.path());
  };
  const auto hint = [entries, start = presentedURL()->path() + "/"](std::size_t i) {
    const FolderEntry& entry = (*entries)[i];
    if (!entry.path.starts_with(start)) return ItemHint::Unknown;  // the top of a library
    return hintFor(entry.kind, std::string_view(entry.path).substr(start.size()));
  };
  return {entries->size(), [entries](std::size_t i) { return URL((*entries)[i].path); }, indexOf, hint};
}

std::vector<FolderSearch::Folder> RootListScreen::searchedFolders() const {
  std::vector<FolderSearch::Folder> folders{{presentedURL()->path(), ""}};
  for (const FolderEntry& library : libraries()) folders.push_back({library.path, library.displayName});
  return folders;
}

}  // namespace vaelo
