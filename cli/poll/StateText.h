// What is told of nodes and lines, on the screen and at the end. Pure.
#pragma once

#include <string>

#include "poll/Snapshot.h"

namespace cli {

/// @return "node 3 ok  p50 12 ms  p99 30 ms  max 55 ms  requests 120  ...", or "node 3 not
/// answering for 12 s  ...". What never happened is left out.
std::string nodeText(const poll::NodeState& node);

/// @return "line 43 % busy  cycle 812 ms  cycles 12  late 3", or "line closed: ...".
std::string lineText(const poll::LineState& line);

/// @return one line for each node and the line, each with its line end.
std::string statisticsText(const poll::Snapshot& snapshot);

}  // namespace cli
