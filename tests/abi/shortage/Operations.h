// The pieces that operations are made of.
#pragma once

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/abi/shortage/Run.h"

namespace shortage {

/// The libraries as they are shipped, loaded once.
const abi_test::Plugin& plugin();

class ShortageTest : public testing::Test {
  protected:
    static void TearDownTestSuite();
};

/// Refuses each request of each operation, prints the counts and expects nothing to go wrong.
/// @return how many requests were refused.
int expectHarmless(const std::vector<Operation>& operations);

Operation atStage(Stage stage, std::string name, std::function<int(World&)> call,
                  Refused refused = Refused::error);

/// An operation on a tag of a started protocol.
Operation onTag(const std::string& name, const std::string& uri, std::function<int(World&)> call,
                Refused refused = Refused::error);

/// The same on a tag of every kind.
std::vector<Operation> onEveryTag(const std::string& name, int (*call)(World&),
                                  Refused refused = Refused::error);

/// Tags of every area, type and shape, some of which can be neither read nor written.
const std::vector<std::string>& uris();

void makeTarget(World& world, const std::string& uri);

/// A value to be written: 1 in the first byte, which every area takes, and zeroes behind it.
const unsigned char* value();

inline constexpr const char* kLongIdent = "an ident that does not fit a short text";

}  // namespace shortage
