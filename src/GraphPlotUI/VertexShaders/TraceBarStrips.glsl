// Bars where rows stand close together: a strip of pixel columns with all bars that reach into it, as one primitive.
// The fragment shader lays the bars over each other. Varyings are in units of the thickness and in the coordinates of
// gl_FragCoord.
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

const int Rows = 16;
const float NoBar = -1.0e9;

flat varying vec4 v_Centre[4];
flat varying vec4 v_HalfHeight[4];
flat varying vec3 v_Rows; // x of the first row, distance of rows, thicknesses per pixel

void main()
{
    float Scale = 1.0 / u_LineThickness;
    float SamplesPerPixel = u_AxisRangeX.y / u_ViewportSize.x;
    float Left = float(gl_InstanceID + u_FirstInstance) * u_StripWidth - mod(u_ViewportOffset.x, 4.0);
    float Reach = u_LineThickness - 0.5; // from the strip's outermost pixel centres, as seen from its edges
    int First = max(int(ceil(((Left - Reach) * SamplesPerPixel + u_AxisRangeX.x) / u_LodScale)), 0);
    float x = (float(First) * u_LodScale - u_AxisRangeX.x) / SamplesPerPixel;
    float Distance = u_LodScale / SamplesPerPixel;
    float ValueToHeight = u_ViewportSize.y / u_AxisRangeY.y;

    float Bottom = 1.0e30;
    float Top = -1.0e30;
    float Centres[Rows];
    float HalfHeights[Rows];
    for (int i = 0; i < Rows; ++i)
    {
        int Index = First + i;
        vec4 Row =
            texelFetch(t_Trace, ivec2(u_ComponentIndex, (Index + u_CircleBufferStart) % u_CircleBufferCapacity), 0);
        float BarHeightInPixels = (Row.y - Row.z) / u_AxisRangeY.y * u_ViewportSize.y;
        bool IsInReach = x + float(i) * Distance < Left + u_StripWidth + Reach;
        bool IsBar = IsInReach && Index < u_RowCount && !isinf(Row.y) && BarHeightInPixels >= 2.0;
        float High = (Row.y - u_AxisRangeY.x) * ValueToHeight;
        float Low = (Row.z - u_AxisRangeY.x) * ValueToHeight;
        Top = IsBar ? max(Top, High) : Top;
        Bottom = IsBar ? min(Bottom, Low) : Bottom;
        float Centre = u_ViewportOffset.y + u_ViewportSize.y - (High + Low) * 0.5;
        Centres[i] = IsBar ? Centre * Scale : 0.0;
        HalfHeights[i] = IsBar ? BarHeightInPixels * 0.5 * Scale : NoBar;
    }
    for (int i = 0; i < Rows / 4; ++i)
    {
        int j = 4 * i;
        v_Centre[i] = vec4(Centres[j], Centres[j + 1], Centres[j + 2], Centres[j + 3]);
        v_HalfHeight[i] = vec4(HalfHeights[j], HalfHeights[j + 1], HalfHeights[j + 2], HalfHeights[j + 3]);
    }
    v_Rows = vec3((u_ViewportOffset.x + x) * Scale, Distance * Scale, Scale);

    vec2 Corner = vec2(Left + u_StripWidth * a_position.x,
                       mix(Bottom - u_LineThickness, Top + u_LineThickness, a_position.y));
    gl_Position = Top < Bottom
                      ? vec4(0.0, 0.0, 0.0, 1.0)
                      : vec4(Corner * 2.0 / vec2(u_ViewportSize.x, -u_ViewportSize.y) - vec2(1.0, -1.0), 0.0, 1.0);
}
