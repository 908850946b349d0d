// The contract of a remote command: named wide texts come in and go out, with a result code.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "host/base/Types.h"

namespace ControlSystem {

// Names compare exactly; an absent name is an empty text to most commands.
using IParameters = std::map<std::wstring, std::wstring>;

struct IResult {
  std::int32_t code = 0;  // 1: success
};

struct CommandDescription {
  std::wstring name, description;
  std::vector<std::wstring> inputs, outputs;
};

class ICommandProvider {
 public:
  // Appends the names that the provider takes.
  virtual void GetCommandNames(std::vector<std::wstring>& names, int unused) const = 0;
  virtual CommandDescription GetCommandDescription(std::wstring const& name) const = 0;
  virtual IResult ExecuteCommand(std::wstring const& name, IParameters const& in, IParameters& out) = 0;
  virtual ~ICommandProvider() = default;
};

// A source of remote notifications; no plug-in provides one so far.
class IEventProvider {
 public:
  virtual ~IEventProvider() = default;
};

}  // namespace ControlSystem
