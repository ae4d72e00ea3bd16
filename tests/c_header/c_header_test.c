/* The public header compiles as C99, and a C host can drive the engine through it. */
#include "lite_vrx.h"

#include <stdio.h>
#include <string.h>

static uint16_t pixels[64 * 32];

int main(void) {
    char version[10];
    WINDOW_INFO info = {0, 0, 16, 16, 0};
    void* win = NULL;
    if (VRX_Open(0, 64, 32, VRX_FMT_RGB565) != 0) return 1;
    if (VRX_SetRenderBuffer(pixels, NULL) != 0) return 2;
    if (VRX_ClearRenderBuffer(255, 0, 0) != 0 || pixels[0] != 0xF800) return 3;
    if (VRX_NewWindow(&info, &win) != 0 || VRX_SelectWindow(win) != 0) return 4;
    if (VRX_GetVersion(version) != 0 || strcmp(version, "v1.0.3.23") != 0) return 5;
    if (VRX_Close() != 0) return 6;
    puts("C host ok");
    return 0;
}
