// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/memory_disk.h"

#include <algorithm>
#include <vector>

namespace vaelo {

namespace {

constexpr int LinkLimit = 40;
constexpr std::string_view PromiseSuffix = ".vlopromise";
constexpr std::string_view LongPromiseSuffix = ".vlopromise-long";

std::vector<std::string> components(const std::string& path) {
  std::vector<std::string> names = URL(path).pathComponents();
  if (!names.empty() && names.front() == "/") names.erase(names.begin());
  return names;
}

std::string parentOf(const std::string& path) { return path.substr(0, path.rfind('/')); }
std::string nameOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

bool isAbsolute(const std::string& path) { return !path.empty() && path.front() == '/'; }

}  // namespace

MemoryItem& MemoryDisk::add(const std::string& path, FileType type, std::uint64_t size) {
  const std::string parent = URL(path).deletingLastPathComponent().path();
  if (parent != "/" && !items.contains(parent)) addFolder(parent);
  MemoryItem& item = items[path];
  item = MemoryItem();
  item.attributes.type = type;
  item.attributes.size = Value(size);
  item.attributes.creationDate = item.attributes.modificationDate = clock_->date();
  return item;
}

MemoryItem& MemoryDisk::addLink(const std::string& path, const std::string& target) {
  MemoryItem& item = add(path, FileType::SymbolicLink, target.size());
  item.linkTarget = target;
  return item;
}

MemoryItem& MemoryDisk::addPromise(const std::string& path, std::uint64_t size) {
  MemoryItem& item = add(path, FileType::Regular, size);
  item.isPromise = true;
  return item;
}

std::optional<std::string> MemoryDisk::follow(const std::string& from, const std::string& name) const {
  std::string at = from;
  std::vector<std::string> pending = {name};  // the next component last
  int links = 0;
  while (!pending.empty()) {
    const std::string next = pending.back();
    pending.pop_back();
    if (next == ".") continue;
    if (next == "..") {
      at = at.empty() ? at : parentOf(at);
      continue;
    }
    const auto found = items.find(at + "/" + next);
    if (found == items.end() || found->second.linkTarget.empty()) {
      at += "/" + next;
      continue;
    }
    if (++links > LinkLimit) return std::nullopt;
    const std::string& target = found->second.linkTarget;
    if (isAbsolute(target)) at.clear();
    const std::vector<std::string> parts = components((isAbsolute(target) ? "" : "/") + target);
    pending.insert(pending.end(), parts.rbegin(), parts.rend());
  }
  return at;
}

std::string MemoryDisk::realPath(const std::string& path) const {
  if (!isAbsolute(path)) return path;
  std::string at;
  for (const std::string& name : components(path)) {
    const std::optional<std::string> next = follow(at, name);
    at = next ? *next : at + "/" + name;
  }
  return at.empty() ? "/" : at;
}

std::string MemoryDisk::place(const std::string& path) const {
  if (items.contains(path)) return path;
  const std::string name = nameOf(path);
  if (name == "." || name == ".." || path.rfind('/') == 0) return realPath(path);
  const std::string parent = realPath(parentOf(path));
  return (parent == "/" ? "" : parent) + "/" + name;
}

MemoryItem* MemoryDisk::logicalItem(const std::string& path) {
  const auto found = items.find(place(path));
  return found == items.end() ? nullptr : &found->second;
}

MemoryItem* MemoryDisk::physicalItem(const std::string& path) {
  if (MemoryItem* item = logicalItem(path)) return item->isPromise ? nullptr : item;
  if (!isPromiseName(nameOf(path))) return nullptr;
  MemoryItem* promised = logicalItem(logicalPath(path));
  return promised && promised->isPromise ? promised : nullptr;
}

bool MemoryDisk::isLocked(const std::string& path) const {
  return std::any_of(items.begin(), items.end(), [where = URL(place(path))](const auto& entry) {
    return entry.second.isLocked && where.isInside(URL(entry.first));
  });
}

bool MemoryDisk::hasFolder(const std::string& path) {
  const std::string real = realPath(path);
  const auto found = items.find(real);
  return real == "/" || (found != items.end() && found->second.isFolder() && !found->second.isPromise);
}

bool MemoryDisk::isPromiseName(const std::string& name) {
  const bool isShort = name.size() > PromiseSuffix.size() + 1 && name.ends_with(PromiseSuffix);
  return name.front() == '.' &&
         (isShort || (name.size() > LongPromiseSuffix.size() + 1 && name.ends_with(LongPromiseSuffix)));
}

std::string MemoryDisk::promisePath(const std::string& path) {
  const std::string name = nameOf(path);
  if (name.size() + PromiseSuffix.size() + 1 <= NameLimit) return parentOf(path) + "/." + name + std::string(PromiseSuffix);
  return parentOf(path) + "/." + std::to_string(std::hash<std::string>()(name)) + std::string(LongPromiseSuffix);
}

std::string MemoryDisk::logicalPath(const std::string& path) const {
  const std::string name = nameOf(path);
  if (!isPromiseName(name)) return path;
  if (name.ends_with(LongPromiseSuffix)) {
    const auto found = std::find_if(items.begin(), items.end(), [where = place(path)](const auto& entry) {
      return entry.second.isPromise && promisePath(entry.first) == where;
    });
    return found == items.end() ? path : found->first;
  }
  return parentOf(path) + "/" + name.substr(1, name.size() - 1 - PromiseSuffix.size());
}

std::int64_t MemoryDisk::documentIDOf(MemoryItem& item) {
  if (item.documentID == 0) item.documentID = ++lastDocumentID_;
  return item.documentID;
}

std::optional<std::string> MemoryDisk::pathOfDocument(std::int64_t documentID) const {
  for (const auto& [path, item] : items) {
    if (documentID != 0 && item.documentID == documentID) return path;
  }
  return std::nullopt;
}

void MemoryDisk::remove(const std::string& place) {
  std::erase_if(items, [root = URL(place)](const auto& entry) { return URL(entry.first).isInside(root); });
}

void MemoryDisk::move(const std::string& from, const std::string& to) {
  std::map<std::string, MemoryItem> moved;
  for (auto& [path, item] : items) {
    if (URL(path).isInside(URL(from))) moved.emplace(to + path.substr(from.size()), std::move(item));
  }
  remove(from);
  items.merge(moved);
}

}  // namespace vaelo
