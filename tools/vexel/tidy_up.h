// What must not outlive the program when a signal ends it.
#pragma once

#include <string>

// The half-written file, or an empty name for none. On SIGINT, SIGTERM, SIGHUP and SIGQUIT it is
// removed before the signal takes its course.
void SetDoomedFile(const std::string& path);
// The process to end before the file goes; 0 for none.
void SetDoomedProcess(int id);
