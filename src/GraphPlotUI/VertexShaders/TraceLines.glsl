// One segment of a trace: the line from the previous row with data to this one, as a quad that reaches past both ends
// by the thickness. A texel holds x mean, y maximum, z minimum, w rows back to the previous row with data.
uniform sampler2D t_Trace;
uniform vec2 u_ViewportSize;
uniform vec2 u_AxisRangeX;
uniform vec2 u_AxisRangeY;
uniform float u_LodScale;
uniform int u_CircleBufferStart;
uniform int u_CircleBufferCapacity;
uniform int u_ComponentIndex;
uniform int u_FirstInstance;
uniform bool u_DrawGaps;
uniform float u_LineThickness;

attribute vec2 a_position;

flat varying vec2 v_SegmentStart;
flat varying vec2 v_SegmentEnd;
varying vec2 v_Position;

vec4 Sample(int i_Index)
{
    return texelFetch(t_Trace, ivec2(u_ComponentIndex, (i_Index + u_CircleBufferStart) % u_CircleBufferCapacity), 0);
}

vec2 ToPixels(int i_Index, float i_Value)
{
    vec2 position = vec2(float(i_Index) * u_LodScale, i_Value);
    vec2 start = vec2(u_AxisRangeX.x, u_AxisRangeY.x);
    vec2 length = vec2(u_AxisRangeX.y, u_AxisRangeY.y);
    return (position - start) / length * u_ViewportSize;
}

void main()
{
    gl_Position = vec4(0.0, 0.0, 0.0, 1.0);
    v_SegmentStart = vec2(0.0);
    v_SegmentEnd = vec2(0.0);
    v_Position = vec2(0.0);

    int Index = gl_InstanceID + u_FirstInstance + 1;
    vec4 Later = Sample(Index);
    float DistanceToPrevious = Later.w;
    int PreviousIndex = Index - int(DistanceToPrevious);
    bool IsGap = DistanceToPrevious > 1.0;
    if (IsGap != u_DrawGaps || isinf(Later.y) || PreviousIndex < 0)
        return;

    v_SegmentStart = ToPixels(PreviousIndex, Sample(PreviousIndex).x);
    v_SegmentEnd = ToPixels(Index, Later.x);
    vec2 LineDirection = normalize(v_SegmentEnd - v_SegmentStart);
    vec2 LineNormal = vec2(LineDirection.y, -LineDirection.x);
    vec2 Corner = (a_position * 2.0 - 1.0) * u_LineThickness;
    v_Position = mix(v_SegmentStart, v_SegmentEnd, a_position.x) + LineDirection * Corner.x + LineNormal * Corner.y;
    gl_Position = vec4(v_Position * 2.0 / vec2(u_ViewportSize.x, -u_ViewportSize.y) - vec2(1.0, -1.0), 0.0, 1.0);
}
