// Lines where rows stand close together: a strip of pixel columns with all segments that reach into it, as one
// parallelogram along them. The fragment shader lays the segments over each other; gaps are not among them. Lengths are
// in units of the thickness, heights are those of gl_FragCoord.
uniform sampler2D t_Trace;
uniform vec2 u_ViewportSize;
uniform vec2 u_ViewportOffset;
uniform vec2 u_AxisRangeX;
uniform vec2 u_AxisRangeY;
uniform float u_LodScale;
uniform int u_CircleBufferStart;
uniform int u_CircleBufferCapacity;
uniform int u_ComponentIndex;
uniform int u_FirstInstance;
uniform int u_RowCount;
uniform float u_StripWidth;
uniform float u_LineThickness;

attribute vec2 a_position;

const int Segments = 17;
const float FarAway = 1.0e9;

flat varying vec4 v_Start[4];
flat varying vec4 v_Rise[4];
flat varying vec4 v_Inverse[4]; // of the squared length
flat varying vec3 v_Last;       // start, rise and inverse of the last segment
flat varying vec3 v_Rows;       // x of the first row, distance of rows, thicknesses per pixel

vec4 Row(int i_Index)
{
    return texelFetch(t_Trace, ivec2(u_ComponentIndex, (i_Index + u_CircleBufferStart) % u_CircleBufferCapacity), 0);
}

void main()
{
    float Scale = 1.0 / u_LineThickness;
    float SamplesPerPixel = u_AxisRangeX.y / u_ViewportSize.x;
    float Left = float(gl_InstanceID + u_FirstInstance) * u_StripWidth - mod(u_ViewportOffset.x, 4.0);
    float Reach = u_LineThickness - 0.5; // from the strip's outermost pixel centres, as seen from its edges
    int First = max(int(ceil(((Left - Reach) * SamplesPerPixel + u_AxisRangeX.x) / u_LodScale)) - 1, 0);
    float FirstX = ((float(First) * u_LodScale - u_AxisRangeX.x) / SamplesPerPixel - Left) * Scale;
    float Distance = u_LodScale / SamplesPerPixel * Scale;
    float Right = (u_StripWidth + Reach) * Scale;
    float ValueToHeight = -u_ViewportSize.y / u_AxisRangeY.y * Scale;
    float Floor = (u_ViewportOffset.y + u_ViewportSize.y) * Scale - u_AxisRangeY.x * ValueToHeight;

    float Heights[Segments + 1];
    bool IsSegment[Segments];
    float Rises[Segments];
    float Inverses[Segments];
    vec2 Begin = vec2(0.0);
    vec2 End = vec2(0.0);
    bool IsEmpty = true;
    vec4 Earlier = Row(First);
    Heights[0] = Earlier.x * ValueToHeight + Floor;
    for (int i = 0; i < Segments; ++i)
    {
        vec4 Later = Row(First + i + 1);
        float x = FirstX + float(i) * Distance;
        bool IsHere = x < Right && First + i + 1 < u_RowCount && Later.w == 1.0 && !isinf(Later.y) && !isinf(Earlier.y);
        Heights[i + 1] = Later.x * ValueToHeight + Floor;
        Begin = IsHere && IsEmpty ? vec2(x, Heights[i]) : Begin;
        End = IsHere ? vec2(x + Distance, Heights[i + 1]) : End;
        IsSegment[i] = IsHere;
        IsEmpty = IsEmpty && !IsHere;
        Earlier = Later;
    }

    float Slope = IsEmpty ? 0.0 : (End.y - Begin.y) / (End.x - Begin.x);
    float Low = FarAway;
    float High = -FarAway;
    for (int i = 0; i < Segments; ++i)
    {
        float x = FirstX + float(i) * Distance;
        float Rise = Heights[i + 1] - Heights[i];
        float AtStart = Heights[i] - Slope * x;
        float AtEnd = Heights[i + 1] - Slope * (x + Distance);
        Low = IsSegment[i] ? min(Low, min(AtStart, AtEnd)) : Low;
        High = IsSegment[i] ? max(High, max(AtStart, AtEnd)) : High;
        Heights[i] = IsSegment[i] ? Heights[i] : FarAway;
        Rises[i] = IsSegment[i] ? Rise : 0.0;
        Inverses[i] = IsSegment[i] ? 1.0 / (Rise * Rise + Distance * Distance) : 0.0;
    }
    for (int i = 0; i < Segments / 4; ++i)
    {
        int j = 4 * i;
        v_Start[i] = vec4(Heights[j], Heights[j + 1], Heights[j + 2], Heights[j + 3]);
        v_Rise[i] = vec4(Rises[j], Rises[j + 1], Rises[j + 2], Rises[j + 3]);
        v_Inverse[i] = vec4(Inverses[j], Inverses[j + 1], Inverses[j + 2], Inverses[j + 3]);
    }
    v_Last = vec3(Heights[Segments - 1], Rises[Segments - 1], Inverses[Segments - 1]);
    v_Rows = vec3((u_ViewportOffset.x + Left) * Scale + FirstX, Distance, Scale);

    // The two triangles share the short diagonal, so that they cut few blocks of pixels in two.
    float Across = Slope > 0.0 ? 1.0 - a_position.y : a_position.y;
    float Spread = sqrt(1.0 + Slope * Slope);
    float x = a_position.x * u_StripWidth * Scale;
    float y = mix(Low - Spread, High + Spread, Across) + Slope * x;
    vec2 Corner = vec2(x * u_LineThickness + Left, y * u_LineThickness - u_ViewportOffset.y);
    gl_Position = IsEmpty ? vec4(0.0, 0.0, 0.0, 1.0) : vec4(Corner * 2.0 / u_ViewportSize - 1.0, 0.0, 1.0);
}
