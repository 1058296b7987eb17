#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>

#include "reader/history.h"

// The history of a folder or an archive, or one event of it.
struct HistoryOf {
  explicit HistoryOf(const std::string& path, const std::optional<std::string>& identity = {}) {
    std::string error;
    From = OpenSource(path, error);
    EXPECT_EQ(error, "");
    Result = From ? ReadHistory(*From, TextDecoder(), Detail::kAll, identity) : History();
  }
  std::unique_ptr<Source> From;
  History Result;
};
