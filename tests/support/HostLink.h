#pragma once

#include <string>

class Machine;

/// A link of the host at `path` that names `target`, a file or a folder that is there, until the object ends. Both are
/// the machine's paths. Hosted it is this process's own; a program of Wine, which makes no links and removes what a
/// link names, has the host's own programs make and remove it.
class HostLink {
public:
    HostLink(const Machine& machine, const std::string& path, const std::string& target);
    ~HostLink();
    HostLink(const HostLink&) = delete;
    HostLink& operator=(const HostLink&) = delete;

private:
    std::string path_;
};
