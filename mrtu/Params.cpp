#include "mrtu/Params.h"

#include <algorithm>
#include <limits>

#include "mrtu/Models.h"

namespace _MRTU {

namespace {

constexpr int kWideNode = -1;
constexpr bool kRequired = false;
constexpr bool kOptional = true;

constexpr std::size_t kFirstPlace = 0;

constexpr int kMaxRegisterBytes = 250;
constexpr int kMaxBits = 2000;

/// Reads one parameter after another until one fails.
class Reader {
  public:
    Reader(CfgParser& parser, int node, int flags, std::string& error)
        : parser_(parser), node_(node), flags_(flags), error_(error) {}

    template <class Value>
    bool required(const char* name, Value& value) {
        return readParam(parser_, name, node_, value, flags_, kRequired, error_);
    }

    template <class Value>
    bool optional(const char* name, Value& value, const Value& fallback) {
        value = fallback;
        return readParam(parser_, name, node_, value, flags_, kOptional, error_);
    }

    /// An optional length: a negative one is refused, one above the limit is lowered to it.
    bool length(const char* name, int& value, int limit) {
        if (!optional(name, value, limit)) return false;
        if (value < 0) {
            error_ = std::string("parameter '") + name + "' out of range";
            return false;
        }
        value = std::min(value, limit);
        return true;
    }

  private:
    CfgParser& parser_;
    int node_;
    int flags_;
    std::string& error_;
};

/// Whether the text itself says "RTU". The default does not count: a configuration that leaves
/// txMode out still has to give "bits".
bool saysRtu(CfgParser& parser) {
    std::string txMode;
    const auto result = parser.getParam("txMode", kWideNode, txMode, CfgParser::CommonOnly);
    return result == CfgParser::Found && txMode == "RTU";
}

}  // namespace

bool NodeParams::parse(CfgParser& parser, int node, std::string& error) {
    Reader readOwn(parser, node, CfgParser::NodeOnly, error);
    Reader read(parser, node, CfgParser::AnyPlace, error);
    const bool ok = readOwn.optional("prefix", prefix, std::string()) &&  //
                    read.required("defNodeId", defNodeId) &&              //
                    read.optional("timeout", timeout, 2000) &&            //
                    read.optional("delay", delay, 0) &&                   //
                    read.optional("repeat", repeat, 2) &&                 //
                    read.length("maxOptLen", maxOptLen, kMaxRegisterBytes) &&
                    read.length("maxBitOptLen", maxBitOptLen, kMaxBits) &&
                    read.optional("presetFunction", presetFunction, std::string("16")) &&
                    read.optional("forceFunction", forceFunction, std::string("15")) &&
                    read.optional("model", model, std::string("1"));
    if (!ok) return false;
    const ModelRow* row = modelRow(model);
    if (row == nullptr || row->zeroBased) oneBased = false;
    return true;
}

bool CommonParams::parse(CfgParser& parser, std::string& error) {
    Reader read(parser, kWideNode, CfgParser::CommonOnly, error);
    return read.optional("txMode", txMode, std::string("RTU")) &&  //
           read.required("uart", uart) &&                          //
           read.required("baudrate", baudrate) &&                  //
           read.required("parity", parity) &&                      //
           (saysRtu(parser) || read.required("bits", bits)) &&     //
           read.required("stopbits", stopbits) &&                  //
           read.required("mode", mode);
}

int maxTransactionTime(const NodeParams& node) {
    const long long product = static_cast<long long>(node.timeout) * node.repeat;
    constexpr long long kLowest = std::numeric_limits<int>::min();
    constexpr long long kHighest = std::numeric_limits<int>::max();
    return static_cast<int>(std::clamp(product, kLowest, kHighest));
}

NodeRecords::NodeRecords(NodeParams wide, std::vector<NodeParams> nodes)
    : wide_(std::move(wide)), nodes_(std::move(nodes)) {
    places_.reserve(nodes_.size());
    for (std::size_t place = 0; place < nodes_.size(); ++place)
        places_.emplace_back(nodes_[place].nodeId, place);
    std::sort(places_.begin(), places_.end());
}

const NodeParams& NodeRecords::of(int node) const {
    const auto at = std::lower_bound(places_.begin(), places_.end(), std::pair(node, kFirstPlace));
    const bool named = at != places_.end() && at->first == node;
    return named ? nodes_[at->second] : wide_;
}

bool ParamManager::parse(const char* text) {
    CfgParser parser(text);
    if (!parser.KnownFormat()) {
        lastError_ = "Parser: unknown format";
        return false;
    }
    NodeParams wide;
    wide.oneBased = records_->wide().oneBased;
    if (!wide.parse(parser, kWideNode, lastError_)) return false;
    int maxTm = std::max(0, maxTransactionTime(wide));

    std::vector<NodeParams> nodes;
    for (int index = 0; index < parser.GetNodeCount(); ++index) {
        NodeParams node = wide;
        node.nodeId = parser.GetNodeID(index);
        if (!node.parse(parser, node.nodeId, lastError_)) return false;
        maxTm = std::max(maxTm, maxTransactionTime(node));
        nodes.push_back(std::move(node));
    }

    CommonParams common;
    if (!common.parse(parser, lastError_)) return false;

    records_ = std::make_shared<const NodeRecords>(std::move(wide), std::move(nodes));
    common_ = std::move(common);
    maxTm_ = maxTm;
    return true;
}

std::shared_ptr<const NodeParams> ParamManager::shareNodeParams(int node) const {
    return {records_, getNodeParams(node)};
}

}  // namespace _MRTU
