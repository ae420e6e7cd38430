#pragma once
#include <cstdint>

#include "record/capture_hooks.h"

namespace ondrel {

// How the recorder reaches its audio input: the chosen input connected to the recorder
// node, which then calls the record hook with every buffer.
class RecordInput {
public:
    virtual ~RecordInput() = default;
    // Connects the input with these hooks (MakeRecordConnection); prints the step that
    // failed. 0 or the error.
    virtual int32_t MakeRecordConnection(RecordHook record, NotifyHook notify, void* cookie) = 0;
    // Starts the recorder node at its time source's now plus delay_us.
    virtual int32_t start(int64_t delay_us) = 0;
    // Stops the node, disconnects, and forgets the source and destination.
    virtual void BreakRecordConnection() = 0;
    virtual void clear_hooks() = 0;
};

}  // namespace ondrel
