attribute vec4 a_position;
attribute vec3 a_normal;
attribute vec4 a_colour;

uniform mat4 u_ViewProjection;
uniform mat4 u_ModelTransform;

varying vec3 v_position;
varying vec3 v_normal;
varying vec4 v_colour;

void main()
{
    vec4 worldPosition = u_ModelTransform * a_position;
    gl_Position = u_ViewProjection * worldPosition;
    v_position = worldPosition.xyz;
    v_normal = mat3(u_ModelTransform) * a_normal;
    v_colour = a_colour;
}
