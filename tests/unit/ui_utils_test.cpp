// SPDX-License-Identifier: GPL-3.0-or-later
// How failures are told, and the rules of renaming.
#include "fileops/ui_utils.h"

#include <gmock/gmock.h>

#include "platform/ui/alert_controller.h"
#include "platform/ui/window.h"
#include "tests/unit/animation_recorder.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::SizeIs;

class UIUtilsTest : public AppFixture {
 protected:
  UIUtilsTest() { loadNav(); }

  static Error error(int code, std::optional<std::string> description = std::nullopt,
                     std::optional<std::string> reason = std::nullopt, const std::string& domain = FileErrorDomain) {
    return {domain, code, {}, std::move(description), std::move(reason)};
  }
  /// Title and message of the one alert that is shown, which then goes.
  std::pair<std::string, std::string> told() {
    const auto alert = presentedAlert();
    if (!alert) return {"no alert", ""};
    nav->dismissViewControllerAnimated(false);
    EXPECT_EQ(presentedAlert(), nullptr) << "only one";
    return {alert->title(), alert->message()};
  }
  std::pair<std::string, std::string> toldOfRename(const Error& failure, const std::string& name) {
    UIUtils::showFriendlyRenameErrorBasenameParentViewController(failure, name, nav);
    return told();
  }
};

using Told = std::pair<std::string, std::string>;

TEST_F(UIUtilsTest, AnAlertHasOneButtonThatDoesNothing) {
  UIUtils::showAlertMessageParentViewController("Title", "Message", nav);
  const auto alert = presentedAlert();
  ASSERT_NE(alert, nullptr);
  EXPECT_EQ(alert->style(), AlertStyle::Alert);
  EXPECT_EQ(alert->title(), "Title");
  EXPECT_EQ(alert->message(), "Message");
  ASSERT_THAT(alert->actions(), SizeIs(1));
  EXPECT_EQ(alert->actions().front()->title(), "OK");
  EXPECT_EQ(alert->actions().front()->style(), AlertActionStyle::Default);
  EXPECT_EQ(alert->actions().front()->handler(), nullptr);
  EXPECT_TRUE(alert->performAction(alert->actions().front()));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(UIUtilsTest, AnAlertComesAnimated) {
  AnimationRecorder recorder;
  const auto window = std::make_shared<Window>();
  window->setPresentationHost(&recorder);
  window->setRootViewController(nav);
  UIUtils::showAlertMessageParentViewController("Title", "Message", nav);
  EXPECT_EQ(recorder.changes, std::vector<std::string>{"present, animated"});
  window->setPresentationHost(nullptr);
}

TEST_F(UIUtilsTest, AnAlertNeedsAScreen) {
  UIUtils::showAlertMessageParentViewController("Title", "", nullptr);
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(UIUtilsTest, AnErrorIsToldInTheBestWordsThatItHas) {
  const auto shown = [this](const std::optional<Error>& failure) {
    UIUtils::showErrorParentViewController(failure, nav);
    return told();
  };
  EXPECT_EQ(shown(error(1, "description", "reason")), Told("description", ""));
  EXPECT_EQ(shown(error(1, std::nullopt, "reason")), Told("reason", ""));
  EXPECT_EQ(shown(error(1)), Told("Error exception", ""));
  EXPECT_EQ(shown(std::nullopt), Told("Error exception", ""));
}

TEST_F(UIUtilsTest, WhatIsUnsupportedIsToldInThePlatformsWords) {
  UIUtils::showUnsupportedError(nav);
  EXPECT_EQ(told(), Told("This can’t be done with this item.", ""));
}

TEST_F(UIUtilsTest, AMoveIsToldWithTheNameAtItsDestination) {
  Error taken = error(FileErrorCode::WriteFileExists, "not these words");
  taken.userInfo[DestinationFilePathErrorKey] = Value("/drive/mirror/Plans/a.txt");
  UIUtils::showFriendlyMoveErrorParentViewController(taken, nav);
  EXPECT_EQ(told(), Told("An item named “a.txt” already exists in the new location.", ""));
  taken.userInfo.clear();
  UIUtils::showFriendlyMoveErrorParentViewController(taken, nav);
  EXPECT_EQ(told(), Told("An item named “” already exists in the new location.", ""));
}

TEST_F(UIUtilsTest, ATakenNameIsToldWithItsExtension) {
  const Error taken = error(FileErrorCode::WriteFileExists);
  const std::string choose = "Choose a different name.";
  EXPECT_EQ(toldOfRename(taken, "a.b.txt"), Told("The name “a.b” with extension “.txt” is already taken.", choose));
  EXPECT_EQ(toldOfRename(taken, "Plans"), Told("The name “Plans” is already taken.", choose));
}

TEST_F(UIUtilsTest, ANameThatCannotBeIsToldWithoutATitle) {
  const std::string text =
      "The name “a:b.txt” can’t be used. Try using a name with fewer characters, or with no punctuation marks.";
  EXPECT_EQ(toldOfRename(error(FileErrorCode::WriteInvalidFileName, "not these words"), "a:b.txt"), Told("", text));
}

TEST_F(UIUtilsTest, OtherFailuresAreToldInTheirOwnWords) {
  EXPECT_EQ(toldOfRename(error(FileErrorCode::WriteOutOfSpace, "The disk is full."), "a"), Told("The disk is full.", ""));
}

TEST_F(UIUtilsTest, TheCodeAloneDecides) {
  EXPECT_EQ(toldOfRename(error(FileErrorCode::WriteFileExists, "words", std::nullopt, "AnotherDomain"), "a").first,
            "The name “a” is already taken.");
  EXPECT_EQ(UIUtils::bestMessage(error(FileErrorCode::WriteFileExists, "words", std::nullopt, "AnotherDomain")),
            "Name is already taken");
}

TEST_F(UIUtilsTest, APromptsLineSaysWhatIsWrong) {
  EXPECT_EQ(UIUtils::bestMessage(std::nullopt), "");
  EXPECT_EQ(UIUtils::bestMessage(error(FileErrorCode::WriteFileExists, "words")), "Name is already taken");
  EXPECT_EQ(UIUtils::bestMessage(error(FileErrorCode::WriteInvalidFileName, "words")), "Character not allowed in filename");
  EXPECT_EQ(UIUtils::bestMessage(error(1, "description", "reason")), "description");
  EXPECT_EQ(UIUtils::bestMessage(error(1, std::nullopt, "reason")), "reason");
  EXPECT_EQ(UIUtils::bestMessage(error(1)), "Error exception");
  EXPECT_EQ(UIUtils::bestMessage(error(FileErrorCode::FeatureUnsupported)), "This can’t be done with this item.");
  EXPECT_EQ(UIUtils::bestMessage(error(FileErrorCode::FeatureUnsupported, "description")), "description");
}

TEST_F(UIUtilsTest, RenamingRefusesInTheGeneralDomain) {
  const URL file = addFile("Notes.pdf");
  for (const char* name : {"", "a/b", ".hidden"}) {
    const auto refused = UIUtils::renameItemAtURLToName(file, name);
    ASSERT_TRUE(refused) << name;
    EXPECT_EQ(refused->domain, FileErrorDomain);
    EXPECT_EQ(refused->code, FileErrorCode::WriteInvalidFileName);
  }
  EXPECT_FALSE(logged("DEBUG", "Name is invalid: ")) << "an empty name has a line of its own";
}

TEST_F(UIUtilsTest, TheSameNameMovesNothing) {
  for (const URL& item : {addFile("Notes.pdf"), addFolder("Plans")}) {
    memory.record.calls.clear();
    EXPECT_EQ(UIUtils::renameItemAtURLToName(item, item.lastPathComponent()), std::nullopt);
    EXPECT_TRUE(
        logged("DEBUG", "Rename: Old and new URLs are the same: " + item.absoluteString() + " - " + item.absoluteString()));
    for (const std::string& call : memory.record.calls) EXPECT_FALSE(call.starts_with("move ")) << call;
  }
}

TEST_F(UIUtilsTest, AnExtensionIsNeitherChangedNorTakenOff) {
  const auto renamed = [](const URL& from, const char* to) { return UIUtils::computeNewURLNewBasename(from, to); };
  EXPECT_EQ(renamed(URL("/d/Notes.pdf"), "Report.PDF"), URL("/d/Report.PDF"));
  EXPECT_EQ(renamed(URL("/d/archive.tar.gz"), "other.tar"), URL("/d/other.tar.gz"));
  EXPECT_EQ(renamed(URL("/d/Notes"), "Report"), URL("/d/Report"));
  EXPECT_EQ(renamed(URL("/d/Plans", true), "Ideas"), URL("/d/Ideas", true));
  EXPECT_EQ(renamed(URL("/d/Plans.old", true), "Ideas"), URL("/d/Ideas.old", true));
}

TEST_F(UIUtilsTest, TheCaretGoesBeforeTheLastDotAndSelectsNothing) {
  TextField field;
  field.setText("archive.tar.gz");
  UIUtils::setCursorInTextFieldToBeforeExtension(field);
  EXPECT_EQ(field.selectedRange(), (TextRange{11, 0}));
  field.setText(".profile");
  UIUtils::setCursorInTextFieldToBeforeExtension(field);
  EXPECT_EQ(field.selectedRange(), (TextRange{0, 0}));
  field.setText("Plans");
  field.setSelectedRange({1, 2});
  UIUtils::setCursorInTextFieldToBeforeExtension(field);
  EXPECT_EQ(field.selectedRange(), (TextRange{1, 2})) << "without a dot it is left alone";
  UIUtils::selectTextInTextFieldRange(field, {2, 3});
  EXPECT_EQ(field.selectedRange(), (TextRange{2, 3}));
}

TEST_F(UIUtilsTest, OnlyATabletIsASlate) {
  EXPECT_FALSE(UIUtils::slateMode());
  makeTablet();
  EXPECT_TRUE(UIUtils::slateMode());
}

}  // namespace
}  // namespace vaelo
