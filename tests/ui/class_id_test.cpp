// The run-time type check and class names, on a small tree of classes built like the windows':
// a root whose chain is empty although it has a base, and a class with an interface in front of
// its window base.
#include "ui_class_id.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class CTestDispatcher {
public:
    virtual ~CTestDispatcher() {}
    virtual void on_event() {}
};

class CTestWindow : public CTestDispatcher {
    QOR_CLASS_ID(CTestWindow, void, "Window")
};

class CTestVisual : public CTestWindow {
    QOR_CLASS_ID(CTestVisual, CTestWindow, "WindowVisual")
};

class CTestButton : public CTestVisual {
    QOR_CLASS_ID(CTestButton, CTestVisual, "Button")
};

class CTestCheckBox : public CTestVisual {
    QOR_CLASS_ID(CTestCheckBox, CTestVisual, "CheckBox")
};

class CTestRadioButton : public CTestCheckBox {
    QOR_CLASS_ID(CTestRadioButton, CTestCheckBox, "RadioButton")
};

class CTestDialog : public CTestVisual {
    QOR_CLASS_ID(CTestDialog, CTestVisual, "Dialog")
};

class ITestConsole {
public:
    virtual ~ITestConsole() {}
    virtual void print(char const *) = 0;
};

// The interface comes first, so the window part doesn't start at the object's address.
class CTestConsole : public ITestConsole, public CTestDialog {
public:
    void print(char const *) override {}
    QOR_CLASS_ID(CTestConsole, CTestDialog, "Console")
};

} // namespace

TEST(ClassId, IsOneStableAddressPerClass) {
    EXPECT_EQ(CTestButton::class_id(), CTestButton::class_id());
    char *const ids[] = {CTestWindow::class_id(),   CTestVisual::class_id(),      CTestButton::class_id(),
                         CTestCheckBox::class_id(), CTestRadioButton::class_id(), CTestDialog::class_id(),
                         CTestConsole::class_id()};
    for (size_t i = 0; i < 7; ++i)
        for (size_t j = i + 1; j < 7; ++j)
            EXPECT_NE(ids[i], ids[j]) << i << " and " << j;
}

TEST(ClassId, ButtonAnswersToItsChainOnly) {
    CTestButton button;
    EXPECT_EQ(&button, button.find_class_by_id(CTestButton::class_id()));
    EXPECT_EQ(static_cast<CTestVisual *>(&button), button.find_class_by_id(CTestVisual::class_id()));
    EXPECT_EQ(static_cast<CTestWindow *>(&button), button.find_class_by_id(CTestWindow::class_id()));
    EXPECT_EQ(nullptr, button.find_class_by_id(CTestCheckBox::class_id()));
    EXPECT_EQ(nullptr, button.find_class_by_id(CTestRadioButton::class_id()));
    static char s_unknown;
    EXPECT_EQ(nullptr, button.find_class_by_id(&s_unknown));
}

TEST(ClassId, DerivedClassAnswersToItsIntermediateBase) {
    CTestRadioButton radio;
    CTestWindow *p_window = &radio;
    EXPECT_EQ(&radio, class_cast<CTestCheckBox>(p_window));
    EXPECT_EQ(&radio, class_cast<CTestRadioButton>(p_window));
    EXPECT_EQ(nullptr, class_cast<CTestButton>(p_window));
    EXPECT_EQ(nullptr, class_cast<CTestDialog>(p_window));

    CTestCheckBox check_box; // a base doesn't answer to its derived class
    EXPECT_EQ(nullptr, class_cast<CTestRadioButton>(static_cast<CTestWindow *>(&check_box)));
}

TEST(ClassId, CastOfNullIsNull) {
    CTestWindow *p_none = nullptr;
    EXPECT_EQ(nullptr, class_cast<CTestButton>(p_none));
}

TEST(ClassId, ResultIsTheSubobjectOfTheClassAskedFor) {
    CTestConsole console;
    CTestWindow *p_window = &console;
    void *const p_dialog = p_window->find_class_by_id(CTestDialog::class_id());
    EXPECT_EQ(static_cast<void *>(static_cast<CTestDialog *>(&console)), p_dialog);
    EXPECT_NE(static_cast<void *>(&console), p_dialog); // the interface sits at the object's address
    EXPECT_EQ(&console, class_cast<CTestConsole>(p_window));
    EXPECT_EQ(static_cast<CTestWindow *>(&console), class_cast<CTestWindow>(p_window));
}

TEST(ClassIdName, IsTheMostDerivedClassNameBuiltOnce) {
    CTestRadioButton radio;
    CTestWindow &window = radio;
    HUID const &name = window.get_class_id();
    EXPECT_STREQ("RadioButton", name.GetName());
    EXPECT_EQ(HUID("RADIOBUTTON"), name);
    EXPECT_EQ(&name, &CTestRadioButton().get_class_id()); // one static HUID per class

    CTestWindow plain;
    EXPECT_EQ(0x8A3DD37E84E20F89ULL, plain.get_class_id().get_hash());
    CTestConsole console;
    EXPECT_STREQ("Console", static_cast<CTestWindow &>(console).get_class_id().GetName());
}
