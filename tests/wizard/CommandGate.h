#pragma once

/// Puts a command processor by which a run can be held (ScriptGate.cpp) in the place of the system's own, for as long
/// as it lives. The wizard starts no other, whatever the environment says. The system's own stands beside it meanwhile.
///
/// The machine must be Wine's, and the test's own.
class CommandGate {
public:
    CommandGate();
    ~CommandGate();
    CommandGate(const CommandGate&) = delete;
    CommandGate& operator=(const CommandGate&) = delete;
};
