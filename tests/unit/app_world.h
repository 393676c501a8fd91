// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <chrono>
#include <map>
#include <memory>
#include <string>

#include "platform/platform.h"
#include "platform/ui/screen_factory.h"

/// The small objects that the world of AppFixture hands out.
namespace vaelo::app_world {

inline const URL Mirror("/drive/mirror", true);
inline const URL Drive("/drive/mirror/com~marrow~Kestrel", true);

inline Error noSuchFile() { return {FileErrorDomain, FileErrorCode::NoSuchFile, {}, "No such file", {}}; }

/// One virtual clock for all queues: what is due runs in the order of its time, then of its coming.
class Clock {
 public:
  void post(std::chrono::nanoseconds delay, Block block) { blocks_.emplace(now_ + delay, std::move(block)); }
  void advance(std::chrono::nanoseconds time) {
    const auto end = now_ + time;
    while (!blocks_.empty() && blocks_.begin()->first <= end) {
      now_ = std::max(now_, blocks_.begin()->first);
      const Block block = std::move(blocks_.begin()->second);
      blocks_.erase(blocks_.begin());
      block();
    }
    now_ = end;
  }
  Date date() const { return Date() + std::chrono::duration_cast<Date::duration>(now_); }

 private:
  std::chrono::nanoseconds now_{};
  std::multimap<std::chrono::nanoseconds, Block> blocks_;
};

class ClockQueue : public DispatchQueue {
 public:
  ClockQueue(std::shared_ptr<Clock> clock, std::string label) : clock_(std::move(clock)), label_(std::move(label)) {}
  void async(Block block) override { clock_->post({}, std::move(block)); }
  void after(std::chrono::nanoseconds delay, Block block) override { clock_->post(delay, std::move(block)); }
  std::string label() const override { return label_; }

 private:
  std::shared_ptr<Clock> clock_;
  std::string label_;
};

class ClockOperations : public OperationQueue {
 public:
  ClockOperations(std::shared_ptr<Clock> clock, std::string name, QualityOfService quality)
      : clock_(std::move(clock)), name_(std::move(name)), quality_(quality) {}
  void addOperation(Block operation) override { clock_->post({}, std::move(operation)); }
  std::string name() const override { return name_; }
  QualityOfService qualityOfService() const override { return quality_; }

 private:
  std::shared_ptr<Clock> clock_;
  std::string name_;
  QualityOfService quality_;
};

class ClockTimer : public TimerSource {
 public:
  ClockTimer(const std::shared_ptr<Clock>& clock, std::chrono::nanoseconds interval, Block handler)
      : handler_(std::make_shared<Block>(std::move(handler))) {
    fire(clock, {}, interval, handler_);
  }

 private:
  static void fire(const std::shared_ptr<Clock>& clock, std::chrono::nanoseconds delay, std::chrono::nanoseconds interval,
                   const std::weak_ptr<Block>& weak) {
    clock->post(delay, [weakClock = std::weak_ptr<Clock>(clock), interval, weak] {
      const auto handler = weak.lock();
      const auto alive = weakClock.lock();
      if (!handler || !alive) return;
      (*handler)();
      fire(alive, interval, interval, weak);
    });
  }
  std::shared_ptr<Block> handler_;
};

struct Offer : StorageOffer {
  explicit Offer(int offerLevel) : level_(offerLevel) {}
  int level() const override { return level_; }
  int level_;
};

struct Activity : UserActivity {
  std::string activityType() const override { return type; }
  Dictionary userInfo() const override { return info; }
  void setUserInfo(Dictionary userInfo) override { info = std::move(userInfo); }
  void setEligibleForBaton(bool) override {}
  void becomeCurrent() override {}
  void resignCurrent() override {}
  std::string type;
  Dictionary info;
};

struct DriveContainer : CloudContainer {
  std::string identifier() const override { return Drive.lastPathComponent(); }
  std::string localizedName() const override { return "Vaelo Drive"; }
  std::optional<URL> documentsFolderURL() const override { return Drive; }
  std::optional<std::vector<DeclaredDocumentType>> documentTypes() const override { return std::nullopt; }
  std::optional<std::string> supportedFolderLevels() const override { return std::nullopt; }
  std::vector<std::string> ownerBundleIdentifiers() const override { return {}; }
  std::optional<Error> deleteAllContents() override { return std::nullopt; }
};

struct Record : DocumentRecord {
  Record(URL url, bool owned) : url_(std::move(url)), owned_(owned) {}
  URL url() const override { return url_; }
  Result<Ranked> applicationsAvailableForOpeningByHandlerRank() override {
    if (!owned_) return Ranked{};
    ApplicationRecord application;
    application.bundleIdentifier = "org.example.Writer";
    application.isInstalled = application.supportsOpenInPlace = true;
    return Ranked{{HandlerRankOwner, {application}}};
  }
  URL url_;
  bool owned_;
};

struct Interaction : DocumentInteractionController {
  explicit Interaction(URL url) : url_(std::move(url)) {}
  URL url() const override { return url_; }
  std::string name() const override { return name_; }
  void setName(std::string name) override { name_ = std::move(name); }
  void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate>) override {}
  bool presentOptionsMenuFromRect(const Rect&, const ViewRef&, bool) override { return true; }
  bool presentOptionsMenuFromBarButtonItem(const BarButtonItemRef&, bool) override { return true; }
  bool openInPlaceWith(const ApplicationRecord&) override { return true; }
  URL url_;
  std::string name_;
};

struct Flow : UpgradeFlowManager {
  Flow(StorageOfferRef offer, ViewControllerRef& presenter) : offer_(std::move(offer)), presenter_(presenter) {}
  StorageOfferRef offer() const override { return offer_; }
  void beginFlowWithPresentingViewController(const ViewControllerRef& presenter) override { presenter_ = presenter; }
  StorageOfferRef offer_;
  ViewControllerRef& presenter_;
};

/// Nobody else is in the way.
struct Coordinator : FileCoordinator {
  std::optional<Error> coordinateReading(const URL& url, unsigned, const Accessor& accessor) override {
    accessor(url);
    return std::nullopt;
  }
  std::optional<Error> coordinateWriting(const URL& url, unsigned, const Accessor& accessor) override {
    accessor(url);
    return std::nullopt;
  }
  std::optional<Error> coordinateWriting(const URL& first, unsigned, const URL& second, unsigned,
                                         const PairAccessor& accessor) override {
    accessor(first, second);
    return std::nullopt;
  }
  void itemWillMove(const URL&, const URL&) override {}
  void itemDidMove(const URL&, const URL&) override {}
};

struct Unavailable : ViewController {
  std::string className() const override { return "DriveUnavailableController"; }
};

}  // namespace vaelo::app_world
