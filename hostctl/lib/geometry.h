// Two small geometry records (screen points and rectangles).
#ifndef HOSTCTL_LIB_GEOMETRY_H
#define HOSTCTL_LIB_GEOMETRY_H

struct VMPoint {
    VMPoint() : x(0), y(0) {}
    int x;
    int y;
};

struct VMRect {
    VMRect() : left(0), top(0), right(0), bottom(0) {}
    int left;
    int top;
    int right;
    int bottom;
};

#endif
