// A fixture for tests that need the runtime: started before each test and
// shut down after it.
#pragma once

#include <oecore/core/runtime.h>

#include <gtest/gtest.h>

class RuntimeScope : public ::testing::Test {
protected:
    void SetUp() override { OmbRuntime::init(); }
    void TearDown() override { OmbRuntime::shutdown(); }
};
