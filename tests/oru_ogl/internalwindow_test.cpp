// The library's hidden window: where it lies, and that neither it nor its class stays.
#include "oru/oru_ogl/internalwindow.h"

#include "tests/support/failure.h"
#include "tests/support/testwindow.h"

#include <gtest/gtest.h>

namespace {

std::string gClass; ///< of the window that was to be made last

/// Notes the class of every window that is to be made, and refuses it.
LRESULT CALLBACK Refuse(int code, WPARAM, LPARAM data) {
    if (code != HCBT_CREATEWND)
        return 0;
    gClass = reinterpret_cast<CBT_CREATEWNDA const *>(data)->lpcs->lpszClass;
    return 1;
}

bool IsRegistered(std::string const &name) {
    WNDCLASSEXA description = {};
    description.cbSize = sizeof description;
    return ::GetClassInfoExA(::GetModuleHandleW(nullptr), name.c_str(), &description) != 0;
}

} // namespace

TEST(InternalWindow, LiesWhereItIsAskedTo) {
    char name[64] = "";
    {
        ORU::OGL::InternalWindow const window(300, 7);
        EXPECT_EQ(1, oru_test::InternalWindows());
        RECT place = {};
        ::GetWindowRect(window.hWnd(), &place);
        EXPECT_EQ(300, place.left);
        EXPECT_EQ(7, place.top);
        ::GetClassNameA(window.hWnd(), name, sizeof name);
    }
    EXPECT_EQ(0, oru_test::InternalWindows());
    EXPECT_FALSE(IsRegistered(name));
}

TEST(InternalWindow, LeavesNoClassWhenItCannotBeMade) {
    HHOOK const hook = ::SetWindowsHookExA(WH_CBT, Refuse, nullptr, ::GetCurrentThreadId());
    EXPECT_FAILURE("Unable to create window", ORU::OGL::InternalWindow(0, 0));
    ::UnhookWindowsHookEx(hook);
    EXPECT_EQ(0u, gClass.find("OpenGL")) << gClass;
    EXPECT_FALSE(IsRegistered(gClass));
}
