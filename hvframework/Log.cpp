#include "hvframework/Log.h"

namespace HVL::Log {

// The look-up by name takes a lock and a search; the reference is kept, since a category never moves.
log4cpp::Category& Detail() {
    static log4cpp::Category& category = log4cpp::Category::getInstance("hvdeploy-detail");
    return category;
}

log4cpp::Category& General() {
    static log4cpp::Category& category = log4cpp::Category::getInstance("halvorn");
    return category;
}

}  // namespace HVL::Log
