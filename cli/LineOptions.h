// The options of every sub-command that talks to a device: which line, which configuration.
#pragma once

#include <string>
#include <vector>

#include "cli/Command.h"
#include "cli/CommandSpec.h"

namespace cli {

struct LineOptions {
    std::string configFile;
    std::vector<std::string> ports;     ///< "com1=/dev/ttyUSB0" or a device alone.
    std::vector<std::string> settings;  ///< "key=value", in front of the configuration's own.
    std::string baud, parity, stopBits, node, model, timeout;  ///< Short forms of settings.
    bool ascii = false;
    bool sim = false;
    bool trace = false;
    bool traceHex = false;      ///< A trace that shows ASCII frames as bytes, too.
    bool traceMeaning = false;  ///< A trace that says what each frame means.
    int minGapMs = 0;  ///< 0..1000, the shortest silence that ends a reply; 0: the driver's own.
    std::string frameEnd = "silence";  ///< What ends a reply; or "length".
    std::string storage;               ///< A file, "none", or empty for the default.
    std::string ident;
    std::string protocol = "MRTU";
};

/// A port name and its device file.
struct PortMapping {
    std::string name;
    std::string device;
};

/// Declares the options, `--plugin` included.
/// @param options  Must live until the action has run.
void addLineOptions(CommandSpec& command, LineOptions& options, CommandContext& context);

/// Declares those of them that make the configuration text.
void addConfigurationOptions(CommandSpec& command, LineOptions& options);

/// @return the configuration text: the file's or the default one, with the options in front.
/// Errors: CommandError (Usage) when the file can't be read or an option is malformed.
std::string configTextOf(const LineOptions& options);

/// @return what --port said. A device without a name serves the configuration's "uart".
std::vector<PortMapping> portsOf(const LineOptions& options, const std::string& configText);

}  // namespace cli
