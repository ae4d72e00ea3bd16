/* A host program built against the installed package. */
#include <lite_vrx.h>

int main(void) {
    char version[10];
    return VRX_GetVersion(version);
}
