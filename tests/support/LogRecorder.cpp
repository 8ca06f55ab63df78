#include "tests/support/LogRecorder.h"

#include <algorithm>
#include <log4cpp/AppenderSkeleton.hh>
#include <log4cpp/LoggingEvent.hh>
#include <mutex>

#include "hvframework/Log.h"

struct LogRecorder::Record {
    mutable std::mutex mutex;
    std::vector<std::string> lines;
};

class LogRecorder::Collector : public log4cpp::AppenderSkeleton {
public:
    explicit Collector(std::shared_ptr<Record> record) : AppenderSkeleton("log-recorder"), record_(std::move(record)) {}
    ~Collector() override { close(); }
    void close() override {}
    [[nodiscard]] bool requiresLayout() const override { return false; }
    void setLayout(log4cpp::Layout* layout) override { delete layout; }

protected:
    void _append(const log4cpp::LoggingEvent& event) override {
        const std::lock_guard guard(record_->mutex);
        record_->lines.push_back(log4cpp::Priority::getPriorityName(event.priority) + " " + event.categoryName + ": " +
                                 event.message);
    }

private:
    std::shared_ptr<Record> record_;
};

LogRecorder::LogRecorder() : record_(std::make_shared<Record>()) {
    for (log4cpp::Category* category : {&HVL::Log::General(), &HVL::Log::Detail()}) {
        auto* appender = new Collector(record_);
        attachments_.push_back({category, category->getPriority(), appender});
        category->addAppender(appender);
        category->setPriority(log4cpp::Priority::DEBUG);
    }
}

LogRecorder::~LogRecorder() {
    for (const Attachment& attachment : attachments_) {
        attachment.category->setPriority(attachment.priority);
        attachment.category->removeAppender(attachment.appender);
    }
}

std::vector<std::string> LogRecorder::Lines() const {
    const std::lock_guard guard(record_->mutex);
    return record_->lines;
}

bool LogRecorder::Has(const std::string& line) const {
    return Count(line) > 0;
}

std::size_t LogRecorder::Count(const std::string& line) const {
    const std::vector<std::string> lines = Lines();
    return static_cast<std::size_t>(std::count(lines.begin(), lines.end(), line));
}

std::vector<std::string> LogRecorder::LinesStartingWith(const std::string& start) const {
    std::vector<std::string> lines = Lines();
    std::erase_if(lines, [&](const std::string& line) { return line.compare(0, start.size(), start) != 0; });
    return lines;
}

std::string LogRecorder::Text() const {
    std::string text;
    for (const std::string& line : Lines()) {
        text += line + "\n";
    }
    return text;
}

void LogRecorder::Clear() {
    const std::lock_guard guard(record_->mutex);
    record_->lines.clear();
}
