// The overrides of a started driver, reached through its special memory areas.
#pragma once

#include <set>
#include <string>
#include <vector>

#include "cli/Session.h"
#include "cli/override/OverrideWords.h"

namespace cli {

/// Errors of every operation: CommandError (Other) when the driver refuses.
class Overrides {
  public:
    /// REQUIRES for all but the removals of stored keys: session.start() succeeded.
    explicit Overrides(Session& session) : session_(session) {}

    std::uint32_t address(int node);
    bool modicon(int node);
    std::uint32_t serial(const SerialSetting& setting);

    void setAddress(int node, std::uint8_t address);
    void setModicon(int node, bool on);
    /// Stages all the changes, then applies them in one step.
    void setSerial(const std::vector<SerialChange>& changes);

    /// @return the nodes that the configuration names or that have an override, ascending.
    std::set<int> nodes();

    /// Tells whether the storage holds just this value.
    bool storesAddress(int node, std::uint32_t address);
    bool storesModicon(int node, bool on);
    bool stores(const SerialSetting& setting, std::uint32_t code);

    /// Takes values out of the storage; they are gone at the next start.
    void forgetAddress(int node);
    void forgetModicon(int node);
    void forget(const SerialSetting& setting);
    void forgetAll();

  private:
    std::uint32_t read(const std::string& uri);
    void write(const std::string& uri, std::uint32_t value, std::size_t bytes);
    std::vector<std::string> keys();
    bool hasKey(const std::string& key);
    bool storesNumber(const std::string& key, int number);
    void removeKey(const std::string& key);
    const char* section();

    Session& session_;
};

}  // namespace cli
