// A disc with a soft edge of one pixel.
uniform vec4 u_TraceColour;

varying float v_Alpha;
varying float v_PixelRadius;

void main()
{
    float PixelsToCentre = length(2.0 * (0.5 - gl_PointCoord) * v_PixelRadius);
    gl_FragColor = vec4(u_TraceColour.rgb, clamp(v_PixelRadius - PixelsToCentre, 0.0, 1.0) * v_Alpha);
}
