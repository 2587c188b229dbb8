// The driver's configuration: what the configuration text says, for each node and for the line.
#pragma once

#include <cstddef>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "framework/CfgParser.h"

namespace _MRTU {

/// The parameters of one node, or of the configuration as a whole.
struct NodeParams {
    std::string prefix;
    int defNodeId = 0;
    int timeout = 2000;       ///< ms, wait for a reply.
    int delay = 0;            ///< ms, pause before each transaction.
    int repeat = 2;           ///< Retries: a transaction makes repeat + 1 attempts.
    int maxOptLen = 250;      ///< Bytes of registers that one request may carry, 0..250.
    int maxBitOptLen = 2000;  ///< Bits that one request may carry, 0..2000.
    std::string presetFunction = "16";
    std::string forceFunction = "15";
    int nodeId = 0;  ///< The number under which the configuration names the node.
    std::string model = "1";
    /// The configured Modicon mode. Parsing only ever clears it: a node record is a copy of the
    /// configuration-wide one and inherits a cleared flag, whatever its own model says.
    bool oneBased = true;

    /// Reads the parameters for `node` (-1: for all nodes). @return false with the message in
    /// `error`; the record then holds what was read so far.
    bool parse(CfgParser& parser, int node, std::string& error);
};

/// The parameters of the serial line.
struct CommonParams {
    std::string txMode = "RTU";
    std::string uart;
    int baudrate = 0;
    std::string parity;
    int bits = 0;  ///< Not read when the text says txMode=RTU; required when it leaves txMode out.
    int stopbits = 0;
    std::string mode;

    bool parse(CfgParser& parser, std::string& error);

    /// Exactly "ASCII" selects ASCII framing; anything else is framed as RTU.
    bool isAscii() const { return txMode == "ASCII"; }
    /// Exactly "RTU" fixes 8 data bits.
    bool isRtu() const { return txMode == "RTU"; }
};

/// The node records that one text made. Never changed once they are in force.
class NodeRecords {
  public:
    NodeRecords() = default;
    /// @param nodes  Each with a number of its own.
    NodeRecords(NodeParams wide, std::vector<NodeParams> nodes);

    const NodeParams& wide() const { return wide_; }
    const std::vector<NodeParams>& nodes() const { return nodes_; }
    /// @return the node's record, or the configuration-wide one when the node is not named.
    const NodeParams& of(int node) const;

  private:
    NodeParams wide_;
    std::vector<NodeParams> nodes_;
    std::vector<std::pair<int, std::size_t>> places_;  ///< Number and place in `nodes_`, sorted.
};

/// Owns the parameters.
/// Threads: the caller orders parse() against everything else.
class ParamManager {
  public:
    /// @return false, with getLastError() set and all else as before, when the text is refused.
    /// Throws std::bad_alloc, with everything as before, when memory is short.
    bool parse(const char* text);

    /// @return the node's record, or the configuration-wide one when the text does not name the
    /// node. Never null; valid until the next parse() that succeeds.
    const NodeParams* getNodeParams(int node) const { return &records_->of(node); }
    /// The same record for a holder that outlives the next parse(). Never null.
    std::shared_ptr<const NodeParams> shareNodeParams(int node) const;
    /// Never null; the one place of the line's parameters, whatever text made them.
    const CommonParams* getCommonParams() const { return &common_; }
    const char* getLastError() const { return lastError_.c_str(); }

    /// @return the greatest timeout times repeat of all records, in ms.
    int getMaxTm() const { return maxTm_; }

    /// The records of the nodes in the order in which the text names them.
    const std::vector<NodeParams>& nodes() const { return records_->nodes(); }

  private:
    std::shared_ptr<const NodeRecords> records_ = std::make_shared<const NodeRecords>();
    CommonParams common_;
    std::string lastError_;
    int maxTm_ = 0;
};

/// timeout times repeat, in ms; a product beyond the range of int is the greatest int.
int maxTransactionTime(const NodeParams& node);

}  // namespace _MRTU
