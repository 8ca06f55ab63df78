#pragma once

#include <log4cpp/AppenderSkeleton.hh>
#include <log4cpp/LoggingEvent.hh>

#include <iostream>
#include <streambuf>

#include "hvframework/Log.h"
#include "tests/installer/Gate.h"

/// Takes what the process writes to std::cout while it lives, line by line, and holds the writer at the gate. Nobody
/// but the thread of a run may write meanwhile.
class HeldOutput : public std::streambuf {
public:
    HeldOutput() : before_(std::cout.rdbuf(this)) {}
    ~HeldOutput() override { std::cout.rdbuf(before_); }
    HeldOutput(const HeldOutput&) = delete;
    HeldOutput& operator=(const HeldOutput&) = delete;

    Gate gate;

protected:
    int overflow(int character) override {
        if (character == '\n') {
            gate.Pass(line_);
            line_.clear();
        } else if (character != traits_type::eof()) {
            line_ += static_cast<char>(character);
        }
        return traits_type::not_eof(character);
    }

private:
    std::streambuf* before_;
    std::string line_;
};

/// Holds a thread that logs a message to "hvdeploy-detail" at the gate, before or after others that record the line
/// have written it. No other thread may log meanwhile: it would wait too.
class HeldLog {
public:
    HeldLog() : appender_(new Holder(gate)) { HVL::Log::Detail().addAppender(appender_); }
    ~HeldLog() { HVL::Log::Detail().removeAppender(appender_); }
    HeldLog(const HeldLog&) = delete;
    HeldLog& operator=(const HeldLog&) = delete;

    Gate gate;

private:
    class Holder : public log4cpp::AppenderSkeleton {
    public:
        explicit Holder(Gate& gate) : AppenderSkeleton("holder"), gate_(gate) {}
        ~Holder() override { close(); }
        void close() override {}
        [[nodiscard]] bool requiresLayout() const override { return false; }
        void setLayout(log4cpp::Layout* layout) override { delete layout; }

    protected:
        void _append(const log4cpp::LoggingEvent& event) override {
            if (event.priority == log4cpp::Priority::INFO) {
                gate_.Pass(event.message);
            }
        }

    private:
        Gate& gate_;
    };

    log4cpp::Appender* appender_;  // the category's own
};
