// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>

#include "platform/error.h"

namespace vaelo {

class LongWork;
class TreeRemovals;

/// Moves what stands at the physical path `from` to `to`, without replacing. Between file systems it copies to a temporary
/// name beside `to`, flushes, compares with the source, renames, and only then removes the source (a folder through
/// `removals`, where given): on failure the source is whole and nothing is left at the destination. Room and permissions
/// are looked at before the first byte is copied. Attributes and times come along. Blocks, or where `longWork` is given lets
/// the main loop go on meanwhile. Errors: those of FileManager, all with DestinationFilePathErrorKey, and 3072 when it was
/// cancelled.
std::optional<Error> moveFile(const std::string& from, const std::string& to, TreeRemovals* removals = nullptr,
                              LongWork* longWork = nullptr);

/// Gives the item that the promise at `promise` stands for the logical path `to`, without replacing. Errors as moveFile.
std::optional<Error> movePromise(const std::string& promise, const std::string& to);

/// The error of a failed move: about `to` when something is there already, else about `from`.
Error moveError(int number, const std::string& from, const std::string& to);

}  // namespace vaelo
