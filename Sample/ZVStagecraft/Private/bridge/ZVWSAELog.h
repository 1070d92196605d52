// Tracing of the extension classes: a line when a function is entered and one when it is left, and the set-up of the
// process's log that a movie asks for.
#pragma once

#include <string>

/// One on the stack of each traced function. Any thread.
class ZVWSAELog {
public:
    ZVWSAELog(const char* className, const char* methodName, int areaId);
    ~ZVWSAELog();
    ZVWSAELog(const ZVWSAELog&) = delete;
    ZVWSAELog& operator=(const ZVWSAELog&) = delete;

    static constexpr char kDefaultFolder[] = "";

    enum Target : unsigned char { kConsole = 1, kFile = 2 };  // bits; the console wins

    /// Switches the six log areas on and off by their bits in `areaMask` and chooses the target. The file is "log.txt"
    /// in `folder`, which ends with "/"; in the current folder when the argument is left out. A file is emptied when
    /// the process logs to it for the first time, and goes on when it does so again. Main thread. 0; 1 when `target`
    /// names none, 2 when the file cannot be opened: the target is then unchanged; 3 for other failures.
    static int InitWSLogs(unsigned int areaMask, unsigned char target, const char* folder = kDefaultFolder);

private:
    const std::string m_ClassName;
    const std::string m_MethodName;
    const int m_AreaId;
};
