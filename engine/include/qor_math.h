// The engine's small math types that cross module boundaries: texture coordinates, movements and
// device positions (vec2_t), and vertex colours (rgba_t). Global namespace, as the engine has them.
#pragma once
#include <climits>

// Two floats: a device position, a texture coordinate or a movement, by use.
struct vec2_t {
    // Across, then down or up as the use says.
    // @{
    float x;
    float y;
    // @}
};

// Three floats: a point or a direction in 3D.
struct vec3_t {
    // The three coordinates.
    // @{
    float x;
    float y;
    float z;
    // @}
};

// A 4 by 4 matrix of floats, row after row: 64 bytes.
struct matr4_t {
    float m[4][4]; // m[row][column]
};

// Four bytes r, g, b, a, each 0 to 255.
class rgba_t {
public:
    // Red, green, blue and opacity (255 opaque).
    // @{
    unsigned char r, g, b, a;
    // @}

    // Transparent black, or the four bytes given.
    // @{
    rgba_t() : r(0), g(0), b(0), a(0) {}
    rgba_t(unsigned char _r, unsigned char _g, unsigned char _b, unsigned char _a)
        : r(_r), g(_g), b(_b), a(_a) {}
    // @}

    // Each byte times _f, clamped to 0 .. 255 and truncated.
    rgba_t operator*(float _f) const {
        return rgba_t(scale(r, _f), scale(g, _f), scale(b, _f), scale(a, _f));
    }
    // Equal when all four bytes are.
    // @{
    bool operator==(rgba_t const &_o) const { return r == _o.r && g == _o.g && b == _o.b && a == _o.a; }
    bool operator!=(rgba_t const &_o) const { return !(*this == _o); }
    // @}

private:
    static unsigned char scale(unsigned char _c, float _f) {
        float v = _c * _f;
        if (!(v > 0.0f)) return 0; // also catches NaN
        if (v >= 255.0f) return 255;
        return static_cast<unsigned char>(v);
    }
};

// A float to an int by cutting toward zero, held at the ends of int's range; NaN gives 0. For
// values that come from data, where a plain conversion of a value out of range is undefined.
inline int trunc_to_int(double _v) {
    if (!(_v == _v)) return 0;
    if (_v >= static_cast<double>(INT_MAX)) return INT_MAX;
    if (_v <= static_cast<double>(INT_MIN)) return INT_MIN;
    return static_cast<int>(_v);
}
