uniform vec4 u_ModelColour;
uniform vec4 u_SourcePoint;

varying vec4 position;

void main()
{
    if (mod(abs(distance(u_SourcePoint.xyz, position.xyz)), 8.0) > 4.0)
        discard;
    gl_FragColor = u_ModelColour;
}
