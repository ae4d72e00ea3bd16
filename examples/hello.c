/* hello: the smallest host. Opens a 240x320 engine over its own colour buffer, clears
 * it, makes a scissored window and clears that, lets the engine report an error onto its
 * on-screen console, and writes the buffer to out/hello.png (or out/hello.ppm without
 * libpng). */
#include "lite_vrx.h"

#include <stdio.h>
#include <string.h>
#include <sys/stat.h>
#ifdef HAVE_PNG
#include <png.h>
#endif

enum {
    W = 240,
    H = 320
};
static uint16_t frame[W * H];

/* RGB565 to 8-bit channels by bit replication, so 0x1F becomes 0xFF exactly. */
static void expand565(uint16_t p, unsigned char* rgb) {
    unsigned r = (p >> 11) & 31, g = (p >> 5) & 63, b = p & 31;
    rgb[0] = (unsigned char)((r << 3) | (r >> 2));
    rgb[1] = (unsigned char)((g << 2) | (g >> 4));
    rgb[2] = (unsigned char)((b << 3) | (b >> 2));
}

static int write_image(const char* path) {
    static unsigned char rgb[W * H * 3];
    int i;
    FILE* f;
    for (i = 0; i < W * H; ++i) expand565(frame[i], rgb + 3 * i);
    f = fopen(path, "wb");
    if (!f) return -1;
#ifdef HAVE_PNG
    {
        png_structp png = png_create_write_struct(PNG_LIBPNG_VER_STRING, NULL, NULL, NULL);
        png_infop info = png_create_info_struct(png);
        int y;
        if (setjmp(png_jmpbuf(png))) {
            png_destroy_write_struct(&png, &info);
            fclose(f);
            return -1;
        }
        png_init_io(png, f);
        png_set_IHDR(png, info, W, H, 8, PNG_COLOR_TYPE_RGB, PNG_INTERLACE_NONE,
                     PNG_COMPRESSION_TYPE_DEFAULT, PNG_FILTER_TYPE_DEFAULT);
        png_write_info(png, info);
        for (y = 0; y < H; ++y) png_write_row(png, rgb + (size_t)y * W * 3);
        png_write_end(png, NULL);
        png_destroy_write_struct(&png, &info);
    }
#else
    fprintf(f, "P6\n%d %d\n255\n", W, H);
    fwrite(rgb, 1, sizeof rgb, f);
#endif
    return fclose(f);
}

int main(void) {
    char version[10], errors[1024];
    WINDOW_INFO info = {20, 40, 200, 120, 0};
    const uint8_t teal[3] = {0, 160, 160};
    void* win = NULL;

    if (VRX_Open(0, W, H, VRX_FMT_RGB565) != 0) return 1;
    VRX_SetRenderBuffer(frame, NULL);
    VRX_ClearRenderBuffer(32, 32, 96);

    if (VRX_NewWindow(&info, &win) != 0) return 1;
    VRX_WindowScissor(win, 10, 10, 180, 60);
    VRX_SelectWindow(win);
    VRX_ClearWindow(win, teal);

    /* A null handle is refused; the engine prints why on its console. */
    VRX_SelectWindow(NULL);

    VRX_GetVersion(version);
    VRX_GetLastError(errors);
    printf("lite_vrx %s\nconsole says:\n%s", version, errors);

    VRX_SwapRenderBuffer();
    mkdir("out", 0755);
#ifdef HAVE_PNG
    if (write_image("out/hello.png") != 0) return 1;
    puts("wrote out/hello.png");
#else
    if (write_image("out/hello.ppm") != 0) return 1;
    puts("wrote out/hello.ppm");
#endif
    return VRX_Close();
}
