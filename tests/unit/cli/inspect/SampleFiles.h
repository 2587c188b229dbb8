// Files to inspect, in a folder that goes with the object.
#pragma once

#include <filesystem>
#include <string>

namespace cli {

class SampleFiles {
  public:
    SampleFiles();
    ~SampleFiles();
    SampleFiles(const SampleFiles&) = delete;
    SampleFiles& operator=(const SampleFiles&) = delete;

    /// @return a path in the folder; nothing is there yet.
    std::string path(const std::string& name) const;
    /// @return the copy's path.
    std::string copyOf(const std::string& file) const;
    /// A copy whose header says that it is for 64-bit ARM.
    std::string foreignCopyOf(const std::string& file) const;
    /// A copy that ends after `bytes` bytes.
    std::string beginningOf(const std::string& file, std::uintmax_t bytes) const;

  private:
    std::filesystem::path folder_;
};

}  // namespace cli
