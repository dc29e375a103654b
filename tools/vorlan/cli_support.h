// Small helpers shared by the host's commands.
#pragma once

#include <string>
#include <vector>

namespace vorlan::cli {

using Args = std::vector<std::string>;

// True when args holds --help or -h.
bool wantsHelp(const Args& args);
// Removes "--name VALUE" (or "--name=VALUE") from args; fallback when absent.
std::string takeOption(Args& args, const std::string& name, const std::string& fallback);
// Removes "--name" from args; true when it was there.
bool takeFlag(Args& args, const std::string& name);
// Prints the code's name and meaning (text or JSON) and returns the code as exit status.
int reportResult(int code, bool json);
// Escapes text for a JSON string literal.
std::string jsonString(const std::string& text);

}  // namespace vorlan::cli
