#pragma once

#include <log4cpp/Priority.hh>
#include <memory>
#include <string>
#include <vector>

namespace log4cpp {
class Appender;
class Category;
}  // namespace log4cpp

/// Collects every line logged to the two categories while it lives, whatever their priorities were before.
///
/// Lines read "PRIORITY category: message", such as "DEBUG hvdeploy-detail: Script execution succeeded". The
/// categories exist once a recorder has been made, which the line parser takes for a set-up logging. Lines may come
/// from any thread.
class LogRecorder {
public:
    LogRecorder();
    ~LogRecorder();
    LogRecorder(const LogRecorder&) = delete;
    LogRecorder& operator=(const LogRecorder&) = delete;

    [[nodiscard]] std::vector<std::string> Lines() const;
    [[nodiscard]] bool Has(const std::string& line) const;
    [[nodiscard]] std::size_t Count(const std::string& line) const;
    [[nodiscard]] std::vector<std::string> LinesStartingWith(const std::string& start) const;
    /// All lines as one text, for a failure message.
    [[nodiscard]] std::string Text() const;
    void Clear();

private:
    struct Record;
    class Collector;
    /// A category as it was, and the appender that it carries meanwhile and owns.
    struct Attachment {
        log4cpp::Category* category;
        log4cpp::Priority::Value priority;
        log4cpp::Appender* appender;
    };
    std::shared_ptr<Record> record_;
    std::vector<Attachment> attachments_;
};
