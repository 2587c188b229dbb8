// Puts a storage in memory in the place of the host's.
#pragma once

#include <gtest/gtest.h>

#include <string>

#include "framework/HostServicePointers.h"
#include "tests/support/FakeStorage.h"

/// Begins with the full storage; another one, or none, can take its place.
class ReplacerTest : public testing::Test {
  protected:
    ReplacerTest() { piPermanentStorage = &storage_; }
    ~ReplacerTest() override { piPermanentStorage = nullptr; }

    void useNoStorage() { piPermanentStorage = nullptr; }
    void usePlainStorage() { piPermanentStorage = &plainStorage_; }

    std::string stored(const std::string& key) const { return contents_.describe("MRTU", key); }

    testing_support::StorageContents contents_;
    testing_support::FakeStorage storage_{contents_};
    testing_support::PlainFakeStorage plainStorage_{contents_};
};
