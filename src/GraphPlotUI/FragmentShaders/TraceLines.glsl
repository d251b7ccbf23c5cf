// A line with a soft edge: full on the segment, nothing at the thickness away from it, linear between.
uniform vec4 u_TraceColour;
uniform float u_LineThickness;
uniform float u_GapOpacity;
uniform bool u_DrawGaps;

flat varying vec2 v_SegmentStart;
flat varying vec2 v_SegmentEnd;
varying vec2 v_Position;

void main()
{
    vec2 Segment = v_SegmentEnd - v_SegmentStart;
    vec2 FromStart = v_Position - v_SegmentStart;
    float Along = clamp(dot(FromStart, Segment) / dot(Segment, Segment), 0.0, 1.0);
    float Distance = length(FromStart - Segment * Along);
    float Alpha = clamp((u_LineThickness - Distance) / u_LineThickness, 0.0, 1.0);
    gl_FragColor = vec4(u_TraceColour.rgb, u_DrawGaps ? Alpha * u_GapOpacity : Alpha);
}
