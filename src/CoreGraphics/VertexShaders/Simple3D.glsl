attribute vec4 a_position;

uniform mat4 u_ViewProjection;

void main()
{
    gl_Position = u_ViewProjection * a_position;
}
