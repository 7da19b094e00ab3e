// A second launch, as from the menu while the window is open somewhere
// behind others: the first copy's window comes to the front and takes the
// keyboard focus, and the second copy ends without a window of its own.
#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "InstalledProgram.h"

namespace
{

using programtest::Program;
using programtest::XSession;

// The window that has the keyboard focus, as the top-level child of the root
// window it belongs to (or PointerRoot / None).
Window FocusedTopLevel(Display* display)
{
    Window focus = 0;
    int revert = 0;
    XGetInputFocus(display, &focus, &revert);
    const Window root = DefaultRootWindow(display);
    while (focus != 0 && focus != PointerRoot && focus != root)
    {
        Window rootOfTree = 0, parent = 0;
        Window* children = nullptr;
        unsigned int count = 0;
        if (!XQueryTree(display, focus, &rootOfTree, &parent, &children, &count))
            return 0;
        if (children != nullptr)
            XFree(children);
        if (parent == root)
            return focus;
        focus = parent;
    }
    return focus;
}

TEST(SecondLaunch, BringsTheFirstWindowToTheFrontAndEnds)
{
    TempFolder folder;
    ASSERT_FALSE(folder.Path().empty());
    XSession x;
    ASSERT_TRUE(x.IsOpen()) << "no X display: run the tests under xvfb-run -a";
    Display* display = XOpenDisplay(nullptr);
    ASSERT_NE(display, nullptr);
    const std::vector<std::string> environment = installtest::Environment(folder.Path());

    Program first(WYX_PROGRAM, environment);
    const Window window = x.WaitForWindow(first);
    ASSERT_NE(window, 0u) << "no window: the program " << first.Outcome();
    // The user works elsewhere: the window no longer has the focus.
    XSetInputFocus(display, PointerRoot, RevertToPointerRoot, CurrentTime);
    XSync(display, False);
    ASSERT_NE(FocusedTopLevel(display), window);

    Program second(WYX_PROGRAM, environment);
    const Window secondWindow = x.WaitForWindow(second);
    EXPECT_EQ(secondWindow, 0u) << "the second copy opened a window";
    const int status = second.Wait();
    EXPECT_TRUE(WIFEXITED(status)) << second.Outcome();

    // The knock is handled on the first copy's main loop: wait until its
    // window has the focus (or the first copy ended, which fails below).
    XSelectInput(display, window, FocusChangeMask);
    while (FocusedTopLevel(display) != window && !first.HasEnded())
    {
        pollfd connection{ConnectionNumber(display), POLLIN, 0};
        ::poll(&connection, 1, 100); // only lets the loop notice a program that ended
        while (XPending(display) > 0)
        {
            XEvent event;
            XNextEvent(display, &event);
        }
    }
    EXPECT_EQ(FocusedTopLevel(display), window) << "the first copy " << first.Outcome();
    XCloseDisplay(display);

    x.RequestClose(window);
    const int firstStatus = first.Wait();
    EXPECT_TRUE(WIFEXITED(firstStatus) && WEXITSTATUS(firstStatus) == 0) << first.Outcome();
}

} // namespace
