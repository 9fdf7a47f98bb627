// A host's static object that uses the library when it is destroyed, after the library was first used.
#include <gtest/gtest.h>

#include <cstdlib>
#include <vector>

#include "basalt/platform.h"
#include "basalt/util.h"

namespace {

// Whatever is made at the first use goes before this object does, unless it stays to the end.
class LateUser {
public:
    ~LateUser() {
        if (m_is_due && !all_is_as_before()) {
            std::_Exit(3);
        }
    }
    bool all_is_as_before() {
        m_is_due = true;
        CString text(" \xC3\x89T\xC3\x89 ");
        text.MakeLower();
        text.Trim();
        return text == L"\u00E9t\u00E9" && text.CompareNoCase(L"\u00C9T\u00C9") == 0 &&
               basalt::HexStringToVector("4f") == std::vector<unsigned char>{0x4F};
    }

private:
    bool m_is_due = false;
};
LateUser late_user;

TEST(HostStatics, use_the_library_until_they_are_gone) {
    EXPECT_TRUE(late_user.all_is_as_before());
}

}  // namespace
