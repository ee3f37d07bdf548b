#pragma once

#include <string>
#include <utility>
#include <vector>

namespace ventrik
{

/// What was done to the fakes, in order: one line an operation. Fakes share one record, so that a
/// test can check the order of a tear-down across them.
class OperationRecord
{
  public:
    void add(std::string operation) { _operations.push_back(std::move(operation)); }
    const std::vector<std::string>& operations() const { return _operations; }
    void clear() { _operations.clear(); }

  private:
    std::vector<std::string> _operations;
};

} // namespace ventrik
