#pragma once

#include <boost/thread/thread.hpp>
#include <memory>
#include <optional>
#include <set>
#include <string>

#include "hvdeploy/src/HVDeployCLI.h"
#include "hvdeploy/src/ProgressListener.h"

namespace HV {

/// One argument line run on a thread of its own, with the latest report kept for a reader that polls.
///
/// The creating thread constructs the job, calls Start() once and then polls the fields of ProgressListener under
/// `lock`; it may call cli->Cancel(). The job has to live until the thread has ended: nothing here waits for it.
class DeployJob : public ProgressListener {
public:
    explicit DeployJob(std::string commandLine);

    /// Before Start(): lets the line's folder be installed from only when all that is read of it are files of these
    /// names.
    void AcceptOnly(std::set<std::string> fileNames) { acceptedNames_ = std::move(fileNames); }

    /// Deletes the front end, and leaves the thread as it is.
    ~DeployJob() override;

    /// Constructs the front end and with it the engine on the calling thread, and then starts the thread that parses
    /// and runs the line. Throws what the engine's constructor throws; no thread has been started then.
    void Start();

    std::string commandLine;
    std::unique_ptr<DeployCLI> cli;
    /// Lives as long as the process and is joined by nobody: the end of the process ends the thread.
    boost::thread* thread = nullptr;

private:
    std::optional<std::set<std::string>> acceptedNames_;
};

}  // namespace HV
