// Premultiplied foreground over background.
Texture2D<float4> over : register(t0);
RWTexture2D<float4> target : register(u0);

[numthreads(16, 16, 1)]
void Composite(uint3 at : SV_DispatchThreadID) {
    float4 top = over[at.xy];
    target[at.xy] = top + target[at.xy] * (1 - top.a);
}
