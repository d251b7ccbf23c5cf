attribute vec4 a_position;

uniform mat4 u_ViewProjection;
uniform vec4 u_Colour;

varying vec4 v_colour;

void main()
{
    gl_Position = u_ViewProjection * a_position;
    v_colour = u_Colour;
}
