// One sample of a trace as a disc, visible where samples are more than five pixels apart.
// A texel holds x mean, y maximum, z minimum, w rows back to the previous row with data.
uniform sampler2D t_Trace;
uniform vec2 u_AxisRangeX;
uniform vec2 u_AxisRangeY;
uniform vec2 u_RectSize;
uniform vec2 u_ValueRange;
uniform float u_FillOpacity;
uniform float u_LodScale;
uniform int u_CircleBufferStart;
uniform int u_CircleBufferCapacity;
uniform int u_ComponentIndex;
uniform int u_FirstInstance;

attribute vec2 a_position;

varying float v_Alpha;
varying float v_PixelRadius;

const float PixelRadius = 3.0;
const float OffScreen = 2.0;

void main()
{
    int Index = gl_InstanceID + u_FirstInstance;
    vec4 Row =
        texelFetch(t_Trace, ivec2(u_ComponentIndex, (Index + u_CircleBufferStart) % u_CircleBufferCapacity), 0);
    float PixelsBetweenSamples = u_RectSize.x / u_AxisRangeX.y;
    v_Alpha = clamp((PixelsBetweenSamples - 5.0) * 0.5, 0.0, 1.0);
    v_PixelRadius = PixelRadius;
    gl_PointSize = 2.0 * PixelRadius;

    float x = (float(Index) * u_LodScale - u_AxisRangeX.x) / u_AxisRangeX.y;
    float y = (Row.x - u_AxisRangeY.x) / u_AxisRangeY.y;
    bool IsHidden = Row.w <= 0.0 || isinf(Row.y) || v_Alpha == 0.0;
    gl_Position = IsHidden ? vec4(0.0, OffScreen, 0.0, 1.0) : vec4(2.0 * x - 1.0, 1.0 - 2.0 * y, 0.0, 1.0);
}
