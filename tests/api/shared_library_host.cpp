// A host that links the component the usual way, through the shared library and its public
// header only: it creates an instance, starts it without a service and deletes it again.
#include <cstdio>

#include "quintarachat.h"

int main() {
    ChatHandle handle = ChNewInstance();
    if (!handle) return 1;
    _tagChatData data{};
    data.lpszUserName = "Host";
    data.lMeetingType = 3;
    int failures = 0;
    failures += ChInitialize(handle, &data) != 0;
    failures += ChHasContent(handle) != 0;
    failures += ChSetConfig(handle, 3, "<chat ver=\"1.0\"><mtype>11</mtype></chat>") != 0;
    failures += ChDeleteInstance(handle) != 0;
    failures += ChDeleteInstance(nullptr) != -1;
    std::printf("%s\n", failures ? "shared library host failed" : "shared library host ran");
    return failures;
}
