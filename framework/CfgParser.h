// The reader of configuration texts.
//
// A text holds the marker "CfgVer=1" and behind it items separated by white space: name=value, or
// Node<n>::name=value for one node. A value ends at white space; "&nbsp;" stands for a blank.
#pragma once

#include <string>
#include <vector>

#include "framework/CfgItems.h"

/// Threads: an object belongs to one thread.
class CfgParser {
  public:
    enum parseResult {
        Found = 0,
        NotGiven = 1,  ///< A node parameter asked for without a node, where nodes have their own.
        NotFound = 2,
        IllegalValue = 3,
        CannotBePrefixed = 4,
        CannotBeNodeIndependent = 5,
        InvalidFlags = 6,
    };

    /// Bits of the lookup flags.
    enum LookupFlags { AnyPlace = 0, CommonOnly = 1, NodeOnly = 2 };

    /// Never fails; see KnownFormat().
    explicit CfgParser(const char* text);

    /// @return whether the marker "CfgVer=1" was found.
    bool KnownFormat() const { return knownFormat_; }

    /// The node numbers that the text names, in order of first appearance.
    int GetNodeCount() const { return static_cast<int>(nodeIds_.size()); }
    /// @return 0 when `index` is not below GetNodeCount().
    int GetNodeID(int index) const;

    /// @return the raw value of the first item called `name` in full, or null; valid until the next
    /// call.
    const char* GetParam(const char* name);

    /// Looks a parameter up for a node (-1: for none); a node's request falls back to the common
    /// value. `value` is stored only when the result is `Found`.
    parseResult getParam(const char* name, int node, std::string& value, int flags);

  private:
    void collectNodes();

    std::string text_;
    std::string lastValue_;
    std::vector<int> nodeIds_;
    bool knownFormat_ = false;
    CfgItems items_;
};

namespace CfgParserN {

/// Decodes a raw text value: every "&nbsp;" becomes a blank. @return true
bool parseValue(const std::string& raw, std::string& value);

/// @return the message for a failed lookup of the parameter `name`.
std::string getErrorString(CfgParser::parseResult result, const char* name);

}  // namespace CfgParserN

/// Reads one parameter. `value` is stored only when it was found, so the caller stores the default
/// before. Instances: int (automatic base) and std::string.
/// @param node      -1 for none.
/// @param optional  A parameter that is not there is no error.
/// @param error     Receives the message of a failure.
/// @return whether the reading may go on.
template <class Value>
bool readParam(CfgParser& parser, const char* name, int node, Value& value, int flags,
               bool optional, std::string& error);

extern template bool readParam<int>(CfgParser&, const char*, int, int&, int, bool, std::string&);
extern template bool readParam<std::string>(CfgParser&, const char*, int, std::string&, int, bool,
                                            std::string&);
