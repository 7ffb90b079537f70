// SPDX-License-Identifier: Apache-2.0
// Loaded into a measured program with LD_PRELOAD, so that the program itself needs no switch. It stands
// between the program and the calls that show on the outside what it does: a frame sent to the X server,
// bytes to and from an internet address.
//
//   VESK_BENCH_FIRST_PAINT=FILE  at the first frame of a window, writes /proc/self/smaps_rollup and the
//   paths of the
//                                loaded libraries to FILE and ends the process with status 0
//   VESK_BENCH_TRACE=FILE        appends a line "NANOSECONDS EVENT" for each such call: paint, connect, send,
//   receive;
//                                time is CLOCK_MONOTONIC, FILE may be a FIFO
#include <sys/socket.h>
#include <xcb/shm.h>
#include <xcb/xcb.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>

#include <dlfcn.h>
#include <fcntl.h>
#include <unistd.h>

namespace {

// Cursors and icons go the same way as windows do, and are smaller.
constexpr int kSmallestWindow = 200;

// Of a library that the caller has loaded. A platform plugin's libraries are not in the global scope, so
// there is no "next" one to be asked for.
template <typename Function>
Function *theReal(const char *library, const char *name)
{
    void *handle = dlopen(library, RTLD_LAZY | RTLD_NOLOAD);
    return reinterpret_cast<Function *>(dlsym(handle == nullptr ? RTLD_NEXT : handle, name));
}

void copyFile(const char *from, FILE *to)
{
    FILE *source = std::fopen(from, "re");
    if (source == nullptr)
        return;
    char line[4096];
    while (std::fgets(line, sizeof line, source) != nullptr)
        std::fputs(line, to);
    std::fclose(source);
}

void endAtFirstPaint(xcb_connection_t *connection)
{
    const char *path = std::getenv("VESK_BENCH_FIRST_PAINT");
    if (path == nullptr)
        return;
    xcb_flush(connection);
    FILE *file = std::fopen(path, "we");
    if (file != nullptr) {
        copyFile("/proc/self/smaps_rollup", file);
        copyFile("/proc/self/maps", file);
        std::fclose(file);
    }
    _exit(file == nullptr ? 1 : 0);
}

void trace(const char *event)
{
    static const int file = [] {
        const char *path = std::getenv("VESK_BENCH_TRACE");
        return path == nullptr ? -1 : open(path, O_WRONLY | O_APPEND | O_CLOEXEC);
    }();
    if (file < 0)
        return;
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC, &now);
    char line[64];
    const int length =
        std::snprintf(line, sizeof line, "%lld %s\n", now.tv_sec * 1000000000LL + now.tv_nsec, event);
    // A lost line shows as an event that the reader misses.
    if (write(file, line, static_cast<size_t>(length)) != length)
        _exit(1);
}

void onFrame(xcb_connection_t *connection, int width)
{
    if (width < kSmallestWindow)
        return;
    endAtFirstPaint(connection);
    trace("paint");
}

bool isInternet(int socket)
{
    sockaddr_storage address = {};
    socklen_t length = sizeof address;
    return getsockname(socket, reinterpret_cast<sockaddr *>(&address), &length) == 0 &&
           (address.ss_family == AF_INET || address.ss_family == AF_INET6);
}

} // namespace

extern "C" {

xcb_void_cookie_t xcb_shm_put_image(xcb_connection_t *c, xcb_drawable_t drawable, xcb_gcontext_t gc,
                                    uint16_t totalWidth, uint16_t totalHeight, uint16_t sourceX,
                                    uint16_t sourceY, uint16_t width, uint16_t height, int16_t x, int16_t y,
                                    uint8_t depth, uint8_t format, uint8_t sendEvent, xcb_shm_seg_t segment,
                                    uint32_t offset)
{
    static auto *const real = theReal<decltype(xcb_shm_put_image)>("libxcb-shm.so.0", "xcb_shm_put_image");
    const xcb_void_cookie_t cookie = real(c, drawable, gc, totalWidth, totalHeight, sourceX, sourceY, width,
                                          height, x, y, depth, format, sendEvent, segment, offset);
    onFrame(c, width);
    return cookie;
}

xcb_void_cookie_t xcb_put_image(xcb_connection_t *c, uint8_t format, xcb_drawable_t drawable,
                                xcb_gcontext_t gc, uint16_t width, uint16_t height, int16_t x, int16_t y,
                                uint8_t leftPad, uint8_t depth, uint32_t length, const uint8_t *data)
{
    static auto *const real = theReal<decltype(xcb_put_image)>("libxcb.so.1", "xcb_put_image");
    const xcb_void_cookie_t cookie =
        real(c, format, drawable, gc, width, height, x, y, leftPad, depth, length, data);
    onFrame(c, width);
    return cookie;
}

int connect(int socket, const sockaddr *address, socklen_t length)
{
    static auto *const real = theReal<decltype(connect)>("libc.so.6", "connect");
    if (address->sa_family == AF_INET || address->sa_family == AF_INET6)
        trace("connect");
    return real(socket, address, length);
}

ssize_t send(int socket, const void *bytes, size_t length, int flags)
{
    static auto *const real = theReal<decltype(send)>("libc.so.6", "send");
    if (isInternet(socket))
        trace("send");
    return real(socket, bytes, length, flags);
}

ssize_t recv(int socket, void *bytes, size_t length, int flags)
{
    static auto *const real = theReal<decltype(recv)>("libc.so.6", "recv");
    const ssize_t received = real(socket, bytes, length, flags);
    if (received > 0 && isInternet(socket))
        trace("receive");
    return received;
}

} // extern "C"
