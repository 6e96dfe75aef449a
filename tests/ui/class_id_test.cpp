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
    QOR_CLASS_ID_ROOT(CTestWindow, "Window")
};
class CTestVisual : public CTestWindow {
    QOR_CLASS_ID(CTestVisual, CTestWindow, "WindowVisual")
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
};
// The interface comes first, so the window part doesn't start at the object's address.
class CTestConsole : public ITestConsole, public CTestVisual {
    QOR_CLASS_ID(CTestConsole, CTestVisual, "Console")
};

} // namespace

TEST(ClassId, AClassAnswersToItsChainWithTheSubobjectAskedForAndItsOwnName) {
    CTestRadioButton radio;
    CTestWindow *p_window = &radio;
    EXPECT_EQ(&radio, class_cast<CTestCheckBox>(p_window));
    EXPECT_EQ(nullptr, class_cast<CTestConsole>(p_window));
    CTestCheckBox check_box; // a base doesn't answer to its derived class
    EXPECT_EQ(nullptr, class_cast<CTestRadioButton>(static_cast<CTestWindow *>(&check_box)));
    EXPECT_STREQ("RadioButton", p_window->get_class_id().GetName());
    EXPECT_EQ(&p_window->get_class_id(), &CTestRadioButton().get_class_id()); // one static HUID per class

    CTestConsole console;
    p_window = &console;
    void *const p_visual = p_window->find_class_by_id(CTestVisual::class_id());
    EXPECT_EQ(static_cast<void *>(static_cast<CTestVisual *>(&console)), p_visual);
    EXPECT_NE(static_cast<void *>(&console), p_visual); // the interface sits at the object's address
    EXPECT_EQ(&console, class_cast<CTestConsole>(p_window));
    EXPECT_STREQ("Console", p_window->get_class_id().GetName());
}
