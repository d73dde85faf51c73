#pragma once

#include "tests/product/ProgramHouse.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <functional>

namespace test {

/// Before the whole program's window.
class ProductTest : public testing::Test, public ProgramHouse {};

/// Before the store alone, without a window.
class HouseTest : public testing::Test, public ProductHouse {};

/// Tells `story` in a process of its own, where nothing has been made yet of what is made once a
/// process. What fails there fails here.
inline void expectInFreshProcess(const std::function<void()>& story) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(
        {
            story();
            std::_Exit(testing::Test::HasFailure() ? 1 : 0);
        },
        testing::ExitedWithCode(0), "");
}

} // namespace test
