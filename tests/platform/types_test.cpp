// A host's other header declared these first, as unixODBC's sql.h does.
#define __SQLTYPES_H  // NOLINT
#define BOOL int
#define DWORD unsigned int
#define FALSE 0
using BYTE = unsigned char;
using WORD = unsigned short;
using HINSTANCE = void*;
using HWND = void*;
using TCHAR = char;
using LPSTR = char*;
enum HostLevel { INFO, WARNING, ERROR };  // hosts name levels of logging so
#include "basalt/basalt.h"
#include "basalt/platform.h"

#include <gtest/gtest.h>

TEST(Types, go_beside_other_declarations_of_the_same) {
    const CString text = _T("text");
    const LPCTSTR characters = text;
    const BOOL result = ReleaseDC(nullptr, nullptr);
    EXPECT_TRUE(characters[0] == L't' && result == FALSE && TRUE == 1);
}
