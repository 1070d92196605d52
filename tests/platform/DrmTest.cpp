// The content-protection library: results as the environment gives them, and nothing to stop when nothing runs.
#include <gtest/gtest.h>
#include <stdlib.h>

#include "player/Drm.h"

namespace {

TEST(DrmTest, ResultsAreTheEnvironments)
{
    const struct {
        const char* variable;
        int (*call)();
    } calls[] = {{"ZV_DRM_TERMINATE_RESULT", Ipriv_drm_Terminate}, {"ZV_DRM_INIT_RESULT", Ipriv_drm_Init}};
    for (const auto& row : calls) {
        EXPECT_EQ(0, row.call());
        setenv(row.variable, "-7", 1);
        EXPECT_EQ(-7, row.call());
        for (const char* text : {"failed", "99999999999"}) {
            setenv(row.variable, text, 1);
            testing::internal::CaptureStderr();
            EXPECT_EQ(-1, row.call());
            EXPECT_EQ(std::string("player: ") + row.variable + " is not a number: " + text + "\n",
                      testing::internal::GetCapturedStderr());
        }
        unsetenv(row.variable);
    }
}

}  // namespace
