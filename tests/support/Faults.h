#pragma once

#include <string>

#include "platform/hosted/machine.h"
#include "tests/support/Machine.h"

/// Breaks the machine on demand. Only the hosted machine can be broken, so tests that use this exist for it alone.
///
/// Everything armed ends with the machine. The calls are those of hosted::Faults, with Windows paths.
class MachineFaults {
public:
    explicit MachineFaults(const Machine&) : faults_(hosted::Machine::Current().GetFaults()) {}

    void FailNth(hosted::Operation operation, std::uint64_t n) { faults_.FailNth(operation, n); }
    void LimitSpace(std::uint64_t bytes) { faults_.LimitSpace(bytes); }
    void Lock(const std::string& path) { faults_.Lock(hosted::Machine::Current().HostPath(path)); }
    void Unlock(const std::string& path) { faults_.Unlock(hosted::Machine::Current().HostPath(path)); }
    void StartCounting() { faults_.StartCounting(); }
    [[nodiscard]] std::uint64_t Count(hosted::Operation operation) const { return faults_.Count(operation); }
    void Disarm() { faults_.Disarm(); }

private:
    hosted::Faults& faults_;
};
