// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/contract/contract_platform.h"
#include "tests/support/memory_platform.h"

namespace vaelo::contract {

namespace {

class MemoryContractPlatform : public ContractPlatform {
 public:
  MemoryContractPlatform() { memory_.disk.addFolder(outside()); }

  FileManager& files() override { return memory_.files; }
  ResourceValues& values() override { return memory_.values; }
  FileCoordination& coordination() override { return memory_.coordination; }
  CloudDocuments& cloud() override { return memory_.cloud; }
  DocumentStore& documents() override { return memory_.documents; }
  FileProvider& provider() override { return memory_.provider; }
  Preferences& preferences() override { return memory_.preferences; }
  Preferences& preferencesAfterRestart() override { return memory_.preferences; }
  Queues& queues() override { return memory_.queues; }
  NotificationCenter& notifications() override { return memory_.notifications; }
  Formatting& formatting() override { return memory_.formatting; }
  TypeIdentifiers& types() override { return memory_.types; }
  CharacterClasses& characters() override { return memory_.characters; }
  UserActivities& activities() override { return memory_.userActivities; }
  FileProgress& progress() override { return memory_.fileProgress; }
  LaunchServices& launch() override { return memory_.launch; }

  std::string mirror() const override { return Mirror.path(); }
  std::string outside() const override { return "/outside"; }

  void addFolder(const std::string& path) override { memory_.disk.addFolder(path); }
  void addFile(const std::string& path, const std::string& bytes) override {
    memory_.disk.add(path, FileType::Regular, bytes.size());
  }
  void addLink(const std::string& path, const std::string& target) override { memory_.disk.addLink(path, target); }
  void addPromise(const std::string& path, const PromiseFacts& facts) override {
    MemoryItem& item = memory_.disk.addPromise(path, facts.size);
    if (facts.isPackage) item.attributes.type = FileType::Directory;
    item.attributes.modificationDate = facts.modified;
    item.attributes.creationDate = facts.created;
    item.shareRole = facts.shareRole;
    item.tags = facts.tags;
  }
  void addBookmark(const std::string& path, const URL& target) override { memory_.disk.add(path).bookmarkTarget = target; }
  void addAlias(const std::string& path, const URL& target) override { memory_.disk.add(path).aliasTarget = target; }
  void addLibrary(const std::string& identifier, const LibraryFacts& facts) override {
    const auto container = memory_.cloud.addContainer(identifier, facts.name);
    if (facts.types) {
      Array types(facts.types->begin(), facts.types->end());
      container->types = {{Value(std::move(types))}};
    }
    container->levels = facts.folderLevels;
    container->owners = facts.owners;
  }
  void setTags(const std::string& path, const std::vector<std::string>& tags) override {
    memory_.disk.items[path].tags = tags;
  }
  void setShareRole(const std::string& path, const std::string& role) override { memory_.disk.items[path].shareRole = role; }
  void hideExtension(const std::string& path) override { memory_.disk.items[path].attributes.extensionHidden = true; }
  void setModified(const std::string& path, Date date) override {
    memory_.disk.items[path].attributes.modificationDate = date;
  }
  void renameBehind(const std::string& from, const std::string& to) override { memory_.others.rename(from, to); }
  void changeBehind(const std::string& path, const std::string& bytes) override {
    memory_.clock->advance(std::chrono::milliseconds(1));
    memory_.others.write(path, bytes.size());
  }
  void removeBehind(const std::string& path) override { memory_.others.remove(path); }
  void setAccount(std::optional<std::string> token) override {
    memory_.cloud.setAccount(token ? std::optional(UbiquityIdentityToken{*token}) : std::nullopt);
  }
  void transfer(const std::string& path, std::int64_t completed, std::int64_t total) override {
    memory_.queues.main().async([this, path, completed, total] {
      memory_.fileProgress.transfer(URL(path), completed, total);
      if (completed < total) return;
      memory_.others.download(path);
      memory_.fileProgress.finish(URL(path));
    });
  }
  bool until(const std::function<bool()>& done) override {
    while (!done()) {
      if (!memory_.clock->runNext()) return false;
    }
    return true;
  }

 private:
  MemoryPlatform memory_;
};

}  // namespace

std::unique_ptr<ContractPlatform> makeMemoryPlatform() { return std::make_unique<MemoryContractPlatform>(); }

}  // namespace vaelo::contract
