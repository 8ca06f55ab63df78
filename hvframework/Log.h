#pragma once

#include <log4cpp/Category.hh>

/// The two categories that every room logs to, and the one way of writing a line.
///
/// A line of a priority that is switched off costs one test: its text is never built. The categories live until the
/// process ends and may be used from any thread. Nothing here sets up appenders or priorities; the front end does.
namespace HVL::Log {

/// "hvdeploy-detail": all lines of the engine and its front end, unless said otherwise.
log4cpp::Category& Detail();

/// "halvorn": general lines. Asking for it brings it into being, which tells the line parser that logging is set up.
log4cpp::Category& General();

}  // namespace HVL::Log

/// Writes `text`, a chain of `<<` operands, to `category` when its priority is enabled: HVL_LOG_TO(c, Warn, "a " << 1).
/// `level` is one of Emerg, Crit, Error, Warn, Info, Debug.
#define HVL_LOG_TO(category, level, text)                             \
    do {                                                              \
        log4cpp::Category& hvlLogCategory = (category);               \
        if (hvlLogCategory.isPriorityEnabled(HVL_PRIORITY_##level)) { \
            hvlLogCategory << HVL_PRIORITY_##level << text;           \
        }                                                             \
    } while (false)

/// The same, to "hvdeploy-detail".
#define HVL_LOG(level, text) HVL_LOG_TO(HVL::Log::Detail(), level, text)

#define HVL_PRIORITY_Emerg log4cpp::Priority::EMERG
#define HVL_PRIORITY_Crit log4cpp::Priority::CRIT
#define HVL_PRIORITY_Error log4cpp::Priority::ERROR
#define HVL_PRIORITY_Warn log4cpp::Priority::WARN
#define HVL_PRIORITY_Info log4cpp::Priority::INFO
#define HVL_PRIORITY_Debug log4cpp::Priority::DEBUG
