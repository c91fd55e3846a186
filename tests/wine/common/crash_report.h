#pragma once

namespace br::test {

// Makes a crash end a Windows test program at once with a report on stderr: the
// exception, the test case it happened in and the stack as module+offset frames.
// Without it Wine starts its debugger, which can wait for ever on a headless machine.
void ReportCrashesAndEnd();

}  // namespace br::test
