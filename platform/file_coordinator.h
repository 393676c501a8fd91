// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/file_presenter.h"

namespace vaelo {

enum ReadingOptions : unsigned { ReadingDefault = 0, ReadingImmediatelyAvailableMetadataOnly = 1 };
enum WritingOptions : unsigned { WritingDefault = 0, WritingForDeleting = 1, WritingForMoving = 2, WritingForReplacing = 4 };

/// One coordinated access. Waits until no other coordinator, of this process or another, is in the way, then runs the
/// accessor on the calling thread before it returns. The accessor gets the URL to use, which may differ from the one asked
/// for. The result is the coordinator's own error; when there is one the accessor was not run.
class FileCoordinator {
 public:
  using Accessor = std::function<void(const URL&)>;
  using PairAccessor = std::function<void(const URL&, const URL&)>;
  virtual ~FileCoordinator() = default;
  virtual std::optional<Error> coordinateReading(const URL& url, unsigned options, const Accessor& accessor) = 0;
  virtual std::optional<Error> coordinateWriting(const URL& url, unsigned options, const Accessor& accessor) = 0;
  virtual std::optional<Error> coordinateWriting(const URL& first, unsigned firstOptions, const URL& second,
                                                 unsigned secondOptions, const PairAccessor& accessor) = 0;
  /// To be called inside an accessor around a move, so that presenters follow the item.
  virtual void itemWillMove(const URL& from, const URL& to) = 0;
  virtual void itemDidMove(const URL& from, const URL& to) = 0;
};

/// Makes coordinators and keeps the presenters. Safe from any thread.
class FileCoordination {
 public:
  virtual ~FileCoordination() = default;
  /// `presenter`, when given, is not told of what this coordinator does.
  virtual std::unique_ptr<FileCoordinator> makeCoordinator(FilePresenter* presenter = nullptr) = 0;
  virtual void addFilePresenter(FilePresenter& presenter) = 0;
  /// When it returns, no callback begins any more.
  virtual void removeFilePresenter(FilePresenter& presenter) = 0;
};

}  // namespace vaelo
