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
class ITestConsole {
public:
    virtual ~ITestConsole() {}
    virtual void print(char const *) = 0;
};
// The interface comes first, so the window part doesn't start at the object's address.
class CTestConsole : public ITestConsole, public CTestVisual {
public:
    void print(char const *) override {}
    QOR_CLASS_ID(CTestConsole, CTestVisual, "Console")
};

} // namespace

TEST(ClassId, AClassAnswersToItsChainOnlyWithTheSubobjectAskedFor) {
    CTestRadioButton radio;
    CTestWindow *p_window = &radio;
    EXPECT_EQ(&radio, class_cast<CTestCheckBox>(p_window));
    EXPECT_EQ(&radio, class_cast<CTestRadioButton>(p_window));
    EXPECT_EQ(nullptr, class_cast<CTestButton>(p_window));
    CTestCheckBox check_box; // a base doesn't answer to its derived class
    EXPECT_EQ(nullptr, class_cast<CTestRadioButton>(static_cast<CTestWindow *>(&check_box)));
    EXPECT_EQ(nullptr, class_cast<CTestButton>(static_cast<CTestWindow *>(nullptr)));
    static char s_unknown;
    EXPECT_EQ(nullptr, radio.find_class_by_id(&s_unknown));

    CTestConsole console;
    p_window = &console;
    void *const p_visual = p_window->find_class_by_id(CTestVisual::class_id());
    EXPECT_EQ(static_cast<void *>(static_cast<CTestVisual *>(&console)), p_visual);
    EXPECT_NE(static_cast<void *>(&console), p_visual); // the interface sits at the object's address
    EXPECT_EQ(&console, class_cast<CTestConsole>(p_window));
}

TEST(ClassId, TheNameIsTheMostDerivedClassesBuiltOnce) {
    CTestRadioButton radio;
    HUID const &name = static_cast<CTestWindow &>(radio).get_class_id();
    EXPECT_STREQ("RadioButton", name.GetName());
    EXPECT_EQ(&name, &CTestRadioButton().get_class_id()); // one static HUID per class
    EXPECT_EQ(HUID("Window"), CTestWindow().get_class_id());
    CTestConsole console;
    EXPECT_STREQ("Console", static_cast<CTestWindow &>(console).get_class_id().GetName());
}
