// The weight of a three-lobed Lanczos filter at a distance.
float Lanczos3(float x) {
    const float pi = 3.14159265;
    x = abs(x);
    return x < 1e-5 ? 1 : x >= 3 ? 0 : 3 * sin(pi * x) * sin(pi * x / 3) / (pi * pi * x * x);
}
