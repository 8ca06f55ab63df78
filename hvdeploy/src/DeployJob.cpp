#include "hvdeploy/src/DeployJob.h"

#include <boost/bind/bind.hpp>
#include <boost/function.hpp>
#include <deque>

namespace HV {
namespace {

// What the thread does. A failing run has told the listener by itself already and is told again here, with the same
// words: a line that does not parse is told here alone.
void RunLine(DeployCLI* cli, std::string line) {
    int code = cli->ParseLine(std::move(line));
    if (code == 0) {
        code = cli->Run();
    }
    if (code != 0 && cli->Listener() != nullptr) {
        cli->Listener()->update(kFailedPercent, "An error occurred during installation.", code);
    }
}

// Threads outlive their jobs, so the process keeps them and not the job.
boost::thread* StartThread(const boost::function<void()>& work) {
    static auto& threads = *new std::deque<std::unique_ptr<boost::thread>>();
    threads.push_back(std::make_unique<boost::thread>(work));
    return threads.back().get();
}

}  // namespace

DeployJob::DeployJob(std::string line) : commandLine(std::move(line)) {}

DeployJob::~DeployJob() = default;

void DeployJob::Start() {
    cli.reset();
    cli = std::make_unique<DeployCLI>(this);
    if (acceptedNames_) {
        cli->Engine().AcceptOnly(*acceptedNames_);
    }
    thread = StartThread(boost::bind(&RunLine, cli.get(), commandLine));
}

}  // namespace HV
