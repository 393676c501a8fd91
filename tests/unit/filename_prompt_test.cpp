// SPDX-License-Identifier: GPL-3.0-or-later
#include "fileops/filename_prompt.h"

#include <gmock/gmock.h>

#include "fileops/new_folder_prompt.h"
#include "fileops/rename_prompt.h"
#include "fileops/ui_utils.h"
#include "platform/ui/window.h"
#include "tests/unit/animation_recorder.h"
#include "tests/unit/app_fixture.h"

namespace vaelo {
namespace {

using ::testing::SizeIs;

class FilenamePromptTest : public AppFixture {
 protected:
  std::shared_ptr<FilenamePrompt> make(const std::optional<std::string>& name,
                                       const std::optional<std::string>& done = std::nullopt) {
    return FilenamePrompt::newWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
        "Title", "Message", "Placeholder", name, done, [this](const std::string& given, bool& accepted) {
          tried.push_back(given);
          accepted = accepts;
          return std::string("refused");
        });
  }
  static std::string errorLine(FilenamePrompt& prompt) { return prompt.errMsgViewController()->messageLabel()->text(); }
  static bool errorHidden(FilenamePrompt& prompt) { return prompt.errMsgViewController()->view()->hidden(); }

  std::vector<std::string> tried;
  bool accepts = true;
};

TEST_F(FilenamePromptTest, IsAnAlertWithAFieldTwoActionsAndAHiddenLine) {
  const auto prompt = make("Notes.pdf");
  EXPECT_EQ(prompt->alert()->style(), AlertStyle::Alert);
  EXPECT_EQ(prompt->alert()->title(), "Title");
  EXPECT_EQ(prompt->alert()->message(), "Message");
  ASSERT_THAT(prompt->alert()->textFields(), SizeIs(1));
  const TextField& field = *prompt->textField();
  EXPECT_EQ(field.text(), "Notes.pdf");
  EXPECT_EQ(field.placeholder(), "Placeholder");
  EXPECT_EQ(field.clearButtonMode(), ClearButtonMode::WhileEditing);
  EXPECT_EQ(field.returnKeyType(), ReturnKeyType::Done);
  EXPECT_FALSE(field.enablesReturnKeyAutomatically());
  EXPECT_EQ(field.autocapitalizationType(), AutocapitalizationType::Words);
  EXPECT_EQ(field.autocorrectionType(), AutocorrectionType::No);
  EXPECT_EQ(field.delegate(), prompt);
  ASSERT_THAT(field.constraints(), SizeIs(1));
  const double line = memory.screens.drawn.fontMetrics(field.font()).lineHeight;
  EXPECT_EQ(field.constraints().front()->constant(), line * 1.2);
  ASSERT_THAT(prompt->alert()->actions(), SizeIs(2));
  EXPECT_EQ(prompt->alert()->actions()[0]->title(), "Cancel");
  EXPECT_EQ(prompt->alert()->actions()[0]->style(), AlertActionStyle::Cancel);
  EXPECT_EQ(prompt->alert()->actions()[0]->handler(), nullptr);
  EXPECT_EQ(prompt->alert()->actions()[1], prompt->defaultAction());
  EXPECT_EQ(prompt->defaultAction()->title(), "Done");
  EXPECT_EQ(prompt->defaultAction()->style(), AlertActionStyle::Default);
  EXPECT_EQ(prompt->defaultAction()->handler(), nullptr) << "what it does it does before it closes";
  EXPECT_EQ(prompt->alert()->contentViewController(), prompt->errMsgViewController());
  EXPECT_TRUE(errorHidden(*prompt));
  EXPECT_EQ(prompt->origFilename(), "Notes.pdf");
}

TEST_F(FilenamePromptTest, AllTextsMayBeAbsent) {
  const auto prompt = FilenamePrompt::newWithTitleMessagePlaceholderFilenameDoneButtonTextCompletion(
      std::nullopt, std::nullopt, std::nullopt, std::nullopt, std::nullopt, [](const std::string&, bool&) { return ""; });
  EXPECT_EQ(prompt->alert()->title(), "");
  EXPECT_EQ(prompt->alert()->message(), "");
  EXPECT_EQ(prompt->textField()->text(), "");
  EXPECT_EQ(prompt->textField()->placeholder(), "");
  EXPECT_EQ(prompt->defaultAction()->title(), "Done");
  EXPECT_EQ(prompt->origFilename(), std::nullopt);
}

TEST_F(FilenamePromptTest, ItsKindsDifferInTheirTextsAlone) {
  const auto nothing = [](const std::string&, bool&) { return std::string(); };
  const auto folder = NewFolderPrompt::newWithTitleDoneButtonTextCompletion("Title", "Create", nothing);
  EXPECT_EQ(folder->alert()->title(), "Title");
  EXPECT_EQ(folder->alert()->message(), "Enter a name for this folder.");
  EXPECT_EQ(folder->textField()->placeholder(), "Folder Name");
  EXPECT_EQ(folder->origFilename(), std::nullopt);
  EXPECT_EQ(folder->defaultAction()->title(), "Create");
  EXPECT_FALSE(folder->defaultAction()->enabled());
  const auto rename = RenamePrompt::newWithFilenameCompletion("Notes.pdf", nothing);
  EXPECT_EQ(rename->alert()->title(), "Rename Item");
  EXPECT_EQ(rename->alert()->message(), "Enter a new name for this item.");
  EXPECT_EQ(rename->textField()->placeholder(), "");
  EXPECT_EQ(rename->textField()->text(), "Notes.pdf");
  EXPECT_EQ(rename->defaultAction()->title(), "Done");
  EXPECT_TRUE(rename->defaultAction()->enabled());
}

TEST_F(FilenamePromptTest, DoneIsEnabledAtTheStartOnlyWithAName) {
  EXPECT_TRUE(make("a")->defaultAction()->enabled());
  EXPECT_FALSE(make("")->defaultAction()->enabled());
  EXPECT_FALSE(make(std::nullopt)->defaultAction()->enabled());
  EXPECT_EQ(make("a", "Go")->defaultAction()->title(), "Go");
  EXPECT_EQ(make("a", "")->defaultAction()->title(), "Done");
}

TEST_F(FilenamePromptTest, TheErrorLineIsRedAndAsHighAsItsText) {
  const auto screen = std::make_shared<SimpleTextViewController>();
  View& view = *screen->view();
  const Label& label = *screen->messageLabel();
  EXPECT_EQ(label.text(), "");
  EXPECT_EQ(label.numberOfLines(), 5);
  EXPECT_EQ(label.font(), Font::preferred(TextStyle::Footnote));
  EXPECT_EQ(label.textColor(), Color::systemRed());
  EXPECT_EQ(SimpleTextViewController::_labelHorizontalInsets(), 16);
  EXPECT_EQ(view.contentHuggingPriority(LayoutAxis::Horizontal), LayoutPriority::Required);
  EXPECT_EQ(view.contentHuggingPriority(LayoutAxis::Vertical), LayoutPriority::Required);
  ASSERT_THAT(view.constraints(), SizeIs(4));
  const LayoutAttribute attributes[] = {LayoutAttribute::Top, LayoutAttribute::Height, LayoutAttribute::Leading,
                                        LayoutAttribute::Trailing};
  const double constants[] = {0, 0, 16, -16};
  for (std::size_t i = 0; i < 4; ++i) {
    const LayoutConstraint& constraint = *view.constraints()[i];
    EXPECT_EQ(constraint.firstAttribute(), attributes[i]);
    EXPECT_EQ(constraint.secondAttribute(), attributes[i]);
    EXPECT_EQ(constraint.firstItem(), i == 1 ? &view : static_cast<const View*>(&label));
    EXPECT_EQ(constraint.secondItem(), i == 1 ? static_cast<const View*>(&label) : &view);
    EXPECT_EQ(constraint.constant(), constants[i]);
  }
  EXPECT_FALSE(label.translatesAutoresizingMaskIntoConstraints());
}

TEST_F(FilenamePromptTest, TheNameIsJudgedWhileItIsTyped) {
  const auto prompt = make(std::nullopt);
  TextField& field = *prompt->textField();
  const auto type = [&](const char* text) { field.userSetText(text); };
  type(".hidden");
  EXPECT_EQ(errorLine(*prompt), "Choose a different name.");
  EXPECT_FALSE(errorHidden(*prompt));
  EXPECT_FALSE(prompt->defaultAction()->enabled());
  EXPECT_FALSE(field.returnKeyEnabled());
  type("a/b");
  EXPECT_EQ(errorLine(*prompt), "Character not allowed in filename");
  type("Plans");
  EXPECT_TRUE(errorHidden(*prompt));
  EXPECT_TRUE(prompt->defaultAction()->enabled());
  EXPECT_TRUE(field.returnKeyEnabled());
  type("   ");
  EXPECT_TRUE(errorHidden(*prompt));
  EXPECT_FALSE(prompt->defaultAction()->enabled());
  type(" .hidden");
  EXPECT_EQ(errorLine(*prompt), "Choose a different name.") << "what counts is the name without blanks";
  type("");
  EXPECT_TRUE(errorHidden(*prompt));
  EXPECT_EQ(errorLine(*prompt), "");
  EXPECT_FALSE(prompt->defaultAction()->enabled());
  EXPECT_FALSE(field.returnKeyEnabled());
  EXPECT_TRUE(tried.empty());
}

TEST_F(FilenamePromptTest, DoneHandsOverTheTrimmedName) {
  const auto prompt = make("x");
  prompt->textField()->userSetText("  Report \n");
  EXPECT_TRUE(prompt->handleDoneAction());
  EXPECT_EQ(tried, std::vector<std::string>{"Report"});
  EXPECT_TRUE(errorHidden(*prompt)) << "what the callback says of a name that it took is nobody's business";
}

TEST_F(FilenamePromptTest, AnInvalidNameIsNotTried) {
  const auto prompt = make("x");
  prompt->textField()->setText("a/b");
  EXPECT_FALSE(prompt->handleDoneAction());
  EXPECT_TRUE(tried.empty());
  EXPECT_TRUE(errorHidden(*prompt)) << "typing explained it";
}

TEST_F(FilenamePromptTest, ARefusalIsShownUntilTheNextValidName) {
  loadNav();
  const auto prompt = make("x");
  nav->presentViewController(prompt->alert(), false);
  accepts = false;
  EXPECT_FALSE(prompt->alert()->performAction(prompt->defaultAction()));
  EXPECT_EQ(presentedAlert(), prompt->alert());
  EXPECT_EQ(errorLine(*prompt), "refused");
  EXPECT_FALSE(errorHidden(*prompt));
  prompt->textField()->userSetText("y");
  EXPECT_TRUE(errorHidden(*prompt));
  accepts = true;
  EXPECT_TRUE(prompt->alert()->performAction(prompt->defaultAction()));
  EXPECT_EQ(presentedAlert(), nullptr);
}

TEST_F(FilenamePromptTest, ReturnIsDone) {
  loadNav();
  const auto prompt = make("x");
  nav->presentViewController(prompt->alert(), false);
  TextField& field = *prompt->textField();
  field.becomeFirstResponder();
  accepts = false;
  EXPECT_FALSE(field.pressReturn());
  EXPECT_TRUE(field.isEditing());
  accepts = true;
  EXPECT_TRUE(field.pressReturn());
  EXPECT_FALSE(field.isEditing());
  EXPECT_EQ(presentedAlert(), nullptr);
  EXPECT_TRUE(logged("DEBUG", "textFieldShouldReturn"));
}

TEST_F(FilenamePromptTest, ReturnPutsTheKeyboardAwayBeforeTheAlertGoes) {
  const auto prompt = make("x");
  TextField& field = *prompt->textField();
  field.becomeFirstResponder();
  EXPECT_TRUE(field.pressReturn());
  EXPECT_FALSE(field.isEditing());
}

TEST_F(FilenamePromptTest, TheAlertGoesAnimated) {
  loadNav();
  AnimationRecorder recorder;
  const auto window = std::make_shared<Window>();
  window->setPresentationHost(&recorder);
  window->setRootViewController(nav);
  const auto prompt = make("x");
  nav->presentViewController(prompt->alert(), false);
  EXPECT_TRUE(prompt->textField()->pressReturn());
  EXPECT_EQ(recorder.dismissals, std::vector<bool>{true});
  window->setPresentationHost(nullptr);
}

TEST_F(FilenamePromptTest, TheKeyboardThatComesTakesDonesState) {
  const auto prompt = make("x");
  TextField& field = *prompt->textField();
  prompt->defaultAction()->setEnabled(false);
  memory.notifications.post({KeyboardWillShowNotification, {}});
  EXPECT_TRUE(field.returnKeyEnabled()) << "another field's keyboard";
  field.becomeFirstResponder();
  memory.notifications.post({KeyboardWillShowNotification, {}});
  EXPECT_FALSE(field.returnKeyEnabled());
}

TEST_F(FilenamePromptTest, EditingBeginsBeforeTheExtension) {
  const auto caret = [this](const char* name) {
    const auto prompt = make(name);
    prompt->textField()->becomeFirstResponder();
    return prompt->textField()->selectedRange();
  };
  EXPECT_EQ(caret("archive.tar.gz"), (TextRange{11, 0}));
  EXPECT_EQ(caret("Überblick.pdf"), (TextRange{9, 0})) << "characters, not bytes";
  EXPECT_EQ(caret("Plans"), (TextRange{5, 0})) << "without an extension it stays";
}

TEST_F(FilenamePromptTest, APromptThatIsGoneHearsNothing) {
  auto prompt = make("x");
  const auto alert = prompt->alert();
  const auto done = prompt->defaultAction();
  prompt = nullptr;
  memory.notifications.post({KeyboardWillShowNotification, {}});
  EXPECT_TRUE(alert->performAction(done)) << "nobody is left to refuse";
  EXPECT_TRUE(tried.empty());
}

TEST_F(FilenamePromptTest, RenamingKeepsTheExtension) {
  const auto renamed = [](const char* from, const char* to) {
    return UIUtils::computeNewURLNewBasename(URL(std::string("/d/") + from), to).path();
  };
  EXPECT_EQ(renamed("Notes.pdf", "Report.txt"), "/d/Report.txt.pdf");
  EXPECT_EQ(renamed("Notes.pdf", "Report"), "/d/Report.pdf");
  EXPECT_EQ(renamed("Notes.pdf", "notes.PDF"), "/d/notes.PDF");
  EXPECT_EQ(renamed("Notes", "Report.txt"), "/d/Report.txt");
}

TEST_F(FilenamePromptTest, ARenameSaysWhatItDid) {
  const URL file = addFile("Notes.pdf");
  EXPECT_EQ(UIUtils::renameItemAtURLToName(file, "")->code, 514);
  EXPECT_TRUE(logged("DEBUG", "Rename: empty, reverting"));
  EXPECT_EQ(UIUtils::renameItemAtURLToName(file, "a/b")->code, 514);
  EXPECT_TRUE(logged("DEBUG", "Name is invalid: a/b"));
  EXPECT_EQ(UIUtils::renameItemAtURLToName(file, "New"), std::nullopt);
  EXPECT_TRUE(logged("DEBUG", "Name is valid: New"));
  EXPECT_NE(memory.disk.logicalItem(Drive.appendingPathComponent("New.pdf").path()), nullptr);
}

TEST_F(FilenamePromptTest, ARenamedBookmarkRenamesItsDocument) {
  const URL outside = addOutsideFile("/home/user/Far.pdf");
  const URL bookmark = addFile("Far.vaelobookmark");
  memory.disk.items.at(bookmark.path()).bookmarkTarget = outside;
  EXPECT_EQ(UIUtils::renameItemAtURLToName(bookmark, "Near"), std::nullopt);
  EXPECT_NE(memory.disk.logicalItem("/home/user/Near.pdf"), nullptr);
  EXPECT_NE(memory.disk.logicalItem(bookmark.path()), nullptr);
  EXPECT_TRUE(logged("DEBUG", "Renaming bookmark " + bookmark.absoluteString() + " (" + outside.absoluteString() + ")"));
}

TEST_F(FilenamePromptTest, ABookmarkToNothingIsRenamedItself) {
  const URL bookmark = addFile("Far.vaelobookmark");
  memory.disk.items.at(bookmark.path()).bookmarkTarget = URL("/home/user/Gone.pdf");
  EXPECT_EQ(UIUtils::renameItemAtURLToName(bookmark, "Near"), std::nullopt);
  EXPECT_NE(memory.disk.logicalItem(Drive.appendingPathComponent("Near.vaelobookmark").path()), nullptr);
}

TEST_F(FilenamePromptTest, AChildScreenIsAddedBeforeItHears) {
  struct Child : ViewController {
    void didMoveToParent(ViewController* to) override {
      EXPECT_EQ(view()->superview(), to->view().get());
      EXPECT_EQ(parent(), to);
      told = true;
    }
    bool told = false;
  };
  const auto parent = std::make_shared<ViewController>();
  const auto child = std::make_shared<Child>();
  UIUtils::addChildViewControllerChildViewController(parent, child);
  EXPECT_TRUE(child->told);
}

}  // namespace
}  // namespace vaelo
