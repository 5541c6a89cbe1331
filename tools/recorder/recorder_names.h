/* The names of files that the recording library, the auditing library and the tool know each other by. */
#ifndef SENSELOOM_RECORDER_NAMES_H
#define SENSELOOM_RECORDER_NAMES_H

/* What the name of every libsenseloom begins with. */
#define SENSELOOM_FILE "libsenseloom.so"
/* What the recording library needs: on a device, the library under this name; on a host the auditing library answers.
 */
#define SENSELOOM_REAL_FILE "libsenseloom-real.so"
/* On a host both stand in one folder. */
#define SENSELOOM_RECORDER_FILE "libsenseloom-recorder.so"
#define SENSELOOM_AUDIT_FILE "libsenseloom-audit.so"

#endif
