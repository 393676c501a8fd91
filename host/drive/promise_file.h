// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/date.h"
#include "platform/result.h"

namespace vaelo {

/// A promise is the small hidden file that stands for an item that is not downloaded. The item DIR/NAME has the physical
/// file DIR/.NAME.vlopromise; a name too long for that gets DIR/.<16 hex>.vlopromise-long, made from a hash of NAME, and
/// NAME is then read from the file. All functions are safe from any thread; names and paths are bytes, not UTF-8.

/// What a promise says of the item. Absent fields are not known.
struct PromiseInfo {
  std::string name;        ///< the item's own name, one path component
  std::uint64_t size = 0;  ///< bytes of the item's content
  std::optional<Date> modified;
  std::optional<Date> created;
  bool package = false;              ///< the item is a package (a folder shown as a document)
  bool extensionHidden = false;      ///< a person sees the name without its extension
  std::optional<std::string> share;  ///< SharedItemRoleOwner or SharedItemRoleParticipant
  std::vector<std::string> tags;     ///< in the order in which they are kept
  std::optional<std::int64_t> documentID;
};

/// The physical file name for the item called `logicalName`; at most 255 bytes for a name of at most 255 bytes.
std::string promiseNameFor(std::string_view logicalName);
/// The physical path for the logical path DIR/NAME.
std::string promisePathFor(const std::string& logicalPath);
/// True when `name` (one component) is that of a promise. Looks at the name alone.
bool isPromiseName(std::string_view name);
/// The logical name behind a short promise name, without touching the disk: nothing for names that are no promises' and for
/// the long form, whose item's name stands in the file.
std::optional<std::string> logicalNameOfShortPromise(std::string_view name);
/// The logical path DIR/NAME for the physical path of a promise; reads the file for the long form only. Nothing when
/// `promisePath` is no promise's, or when its file is damaged or names something that is not one component of this folder.
std::optional<std::string> logicalNameOf(const std::string& promisePath);
/// The path to look at for an item: `path` when something stands there (links not followed) or when it is a promise's own;
/// else the item's promise when that exists; else nothing.
std::optional<std::string> physicalPathOf(const std::string& path);

/// Reads at most 64 KiB of a regular file. Errors: 260 no such file, 257 no permission, 256 damaged or anything else.
/// For a short promise the file's name decides what the item is called, and a Name key that disagrees is ignored.
Result<PromiseInfo> readPromise(const std::string& promisePath);
/// Writes the promise of `info.name` into `folder`, replacing one that is there: a temporary name in the same folder,
/// flushed, renamed, the folder flushed. Either the old or the new promise survives a crash. Errors: those of FileManager.
std::optional<Error> writePromise(const std::string& folder, const PromiseInfo& info);
/// Writes the tags into a promise, likewise; none takes the key away.
std::optional<Error> setPromiseTags(const std::string& promisePath, const std::vector<std::string>& tags);
/// Writes the identifier into a promise as writePromise does and keeps all else that the file says.
std::optional<Error> setPromiseDocumentID(const std::string& promisePath, std::int64_t documentID);

}  // namespace vaelo
