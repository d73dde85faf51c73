#include "platform/base/Text.h"

#include <gtest/gtest.h>

int main(int argc, char** argv) {
    ::testing::InitGoogleTest(&argc, argv);
    platform::loadLocalizedTexts("en_US");
    return RUN_ALL_TESTS();
}
