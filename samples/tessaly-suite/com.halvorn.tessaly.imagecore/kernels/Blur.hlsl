// Separable blur along one axis; the weights come from the host side.
Texture2D<float4> source : register(t0);
RWTexture2D<float4> target : register(u0);
cbuffer Settings : register(b0) { int2 axis; int radius; float4 weights[16]; };

[numthreads(16, 16, 1)]
void Blur(uint3 at : SV_DispatchThreadID) {
    float4 sum = 0;
    for (int i = -radius; i <= radius; ++i) {
        sum += source[int2(at.xy) + axis * i] * weights[abs(i) / 4][abs(i) % 4];
    }
    target[at.xy] = sum;
}
