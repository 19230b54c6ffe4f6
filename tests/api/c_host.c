/* A host written in C that links the component through its public header and the shared
 * library only: the header compiles as C99, and the library serves a C caller, which starts an
 * instance with a null notification object and no service. */
#include <stdio.h>

#include "quintarachat.h"

int main(void) {
    ChatData data = {0};
    ChatHandle handle = ChNewInstance();
    int failures = 0;
    if (!handle) return 1;
    data.pHostSink = NULL;
    data.lpszUserName = "C host";
    data.lMeetingType = 1;
    failures += ChInitialize(handle, &data) != 0;
    failures += ChHasContent(handle) != 0;
    failures += ChSetConfig(handle, 3, "<chat ver=\"1.0\"><mtype>11</mtype></chat>") != 0;
    failures += ChDeleteInstance(handle) != 0;
    failures += ChDeleteInstance(NULL) != -1;
    printf("%s\n", failures ? "C host failed" : "C host ran");
    return failures;
}
