#pragma once

#include "tests/product/ProgramHouse.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace test {

class ProductTest : public testing::Test, public ProgramHouse {};

} // namespace test
