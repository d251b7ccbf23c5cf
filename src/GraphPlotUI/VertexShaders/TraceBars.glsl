// The spread of one row: a vertical bar from its maximum to its minimum, where that is two pixels or more.
// A texel holds x mean, y maximum, z minimum, w rows back to the previous row with data.
uniform sampler2D t_Trace;
uniform vec2 u_ViewportSize;
uniform vec2 u_AxisRangeX;
uniform vec2 u_AxisRangeY;
uniform float u_LodScale;
uniform int u_CircleBufferStart;
uniform int u_CircleBufferCapacity;
uniform int u_ComponentIndex;
uniform int u_FirstInstance;
uniform float u_LineThickness;

attribute vec2 a_position;

flat varying vec2 v_SegmentStart;
flat varying vec2 v_SegmentEnd;
varying vec2 v_Position;

void main()
{
    gl_Position = vec4(0.0, 0.0, 0.0, 1.0);
    v_SegmentStart = vec2(0.0);
    v_SegmentEnd = vec2(0.0);
    v_Position = vec2(0.0);

    int Index = gl_InstanceID + u_FirstInstance;
    vec4 Row =
        texelFetch(t_Trace, ivec2(u_ComponentIndex, (Index + u_CircleBufferStart) % u_CircleBufferCapacity), 0);
    float BarHeightInPixels = (Row.y - Row.z) / u_AxisRangeY.y * u_ViewportSize.y;
    if (isinf(Row.y) || BarHeightInPixels < 2.0)
        return;

    float x = (float(Index) * u_LodScale - u_AxisRangeX.x) / u_AxisRangeX.y * u_ViewportSize.x;
    vec2 y = (Row.yz - u_AxisRangeY.x) / u_AxisRangeY.y * u_ViewportSize.y;
    v_SegmentStart = vec2(x, y.x);
    v_SegmentEnd = vec2(x, y.y);
    v_Position = mix(v_SegmentStart + u_LineThickness, v_SegmentEnd - u_LineThickness, a_position);
    gl_Position = vec4(v_Position * 2.0 / vec2(u_ViewportSize.x, -u_ViewportSize.y) - vec2(1.0, -1.0), 0.0, 1.0);
}
