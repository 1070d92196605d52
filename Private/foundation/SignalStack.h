// The calling thread's stack for signal handlers, as long as the object exists: a thread that has used up its own stack
// can be reported on another one only. Does nothing on a thread that has one already (a sanitizer's), or without
// memory.
#pragma once

class SignalStack {
public:
    SignalStack();
    ~SignalStack();
    SignalStack(const SignalStack&) = delete;
    SignalStack& operator=(const SignalStack&) = delete;

private:
    void* m_Memory = nullptr;
};
